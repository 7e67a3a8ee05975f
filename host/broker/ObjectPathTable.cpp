#include "Convert.h"
#include "Data.h"
#include "EntrySlots.h"

#include <cim/ObjectPath.h>

namespace qelo::broker {
namespace {

StringObject* nameIn(ObjectPathObject& path, std::string_view text) {
    return path.arena->name(text, nameHash(text));
}

const char* givenText(const char* text) {
    if (!text) {
        throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
    }
    return text;
}

CMPIStatus setNameSpace(const CMPIObjectPath* self, const char* nameSpace) {
    return statusSlot([&] {
        ObjectPathObject& path = alive<ObjectPathObject>(self);
        path.nameSpace = nameIn(path, givenText(nameSpace));
    });
}

CMPIString* getNameSpace(const CMPIObjectPath* self, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr,
                             [&] { return &alive<ObjectPathObject>(self).nameSpace->cmpi; });
}

CMPIStatus setHostname(const CMPIObjectPath* self, const char* host) {
    return statusSlot([&] {
        ObjectPathObject& path = alive<ObjectPathObject>(self);
        path.host = nameIn(path, givenText(host));
    });
}

CMPIString* getHostname(const CMPIObjectPath* self, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr,
                             [&] { return &alive<ObjectPathObject>(self).host->cmpi; });
}

CMPIStatus setClassName(const CMPIObjectPath* self, const char* className) {
    return statusSlot([&] {
        ObjectPathObject& path = alive<ObjectPathObject>(self);
        path.className = nameIn(path, givenText(className));
    });
}

CMPIString* getClassName(const CMPIObjectPath* self, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr,
                             [&] { return &alive<ObjectPathObject>(self).className->cmpi; });
}

CMPIStatus addKey(const CMPIObjectPath* self, const char* name, const CMPIValue* value,
                  CMPIType type) {
    return statusSlot([&] {
        ObjectPathObject& path = alive<ObjectPathObject>(self);
        const std::string_view given = givenName(name);
        if (!value) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        const CMPIData data = storeData(*path.arena, value, type, ValueUse::Key);
        if ((data.state & CMPI_nullValue) != 0) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        path.keys.set(*path.arena, given, data);
    });
}

CMPIData asKey(CMPIData data) {
    data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
    return data;
}

CMPIData getKey(const CMPIObjectPath* self, const char* name, CMPIStatus* st) {
    return slot(st, absentData(),
                [&] { return asKey(entryNamed(alive<ObjectPathObject>(self).keys, name).data); });
}

CMPIData getKeyAt(const CMPIObjectPath* self, CMPICount index, CMPIString** name, CMPIStatus* st) {
    return positionSlot(name, st, [&] {
        return asKey(entryAt(alive<ObjectPathObject>(self).keys, index, name).data);
    });
}

CMPICount getKeyCount(const CMPIObjectPath* self, CMPIStatus* st) {
    return slot<CMPICount>(st, 0, [&] { return countOf(alive<ObjectPathObject>(self).keys); });
}

void copyPlace(ObjectPathObject& to, const ObjectPathObject& from) {
    to.nameSpace = nameIn(to, from.nameSpace->view());
    to.className = nameIn(to, from.className->view());
}

CMPIStatus setNameSpaceFromObjectPath(const CMPIObjectPath* self, const CMPIObjectPath* source) {
    return statusSlot(
        [&] { copyPlace(alive<ObjectPathObject>(self), alive<ObjectPathObject>(source)); });
}

CMPIStatus setHostAndNameSpaceFromObjectPath(const CMPIObjectPath* self,
                                             const CMPIObjectPath* source) {
    return statusSlot([&] {
        ObjectPathObject& to = alive<ObjectPathObject>(self);
        const ObjectPathObject& from = alive<ObjectPathObject>(source);
        copyPlace(to, from);
        to.host = nameIn(to, from.host->view());
    });
}

// The schema's qualifiers are not offered to providers.
CMPIData noQualifier(const CMPIObjectPath* self, CMPIStatus* st) {
    return slot(st, absentData(), [&]() -> CMPIData {
        (void)alive<ObjectPathObject>(self);
        throw Refusal{CMPI_RC_ERR_NOT_SUPPORTED};
    });
}

CMPIData getClassQualifier(const CMPIObjectPath* self, const char*, CMPIStatus* st) {
    return noQualifier(self, st);
}

CMPIData getPropertyQualifier(const CMPIObjectPath* self, const char*, const char*,
                              CMPIStatus* st) {
    return noQualifier(self, st);
}

CMPIData getMethodQualifier(const CMPIObjectPath* self, const char*, const char*, CMPIStatus* st) {
    return noQualifier(self, st);
}

CMPIData getParameterQualifier(const CMPIObjectPath* self, const char*, const char*, const char*,
                               CMPIStatus* st) {
    return noQualifier(self, st);
}

CMPIString* toString(const CMPIObjectPath* self, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr, [&] {
        ObjectPathObject& path = alive<ObjectPathObject>(self);
        const bool withHost = path.host->length != 0;
        const std::string text = toCim(path).toText(withHost);
        return &newString(*path.arena, text, Ownership::Contained)->cmpi;
    });
}

} // namespace

const CMPIObjectPathFT ObjectPathObject::table = {
    CMPIVersion200,
    releaseSlot<ObjectPathObject>,
    cloneSlot<ObjectPathObject>,
    setNameSpace,
    getNameSpace,
    setHostname,
    getHostname,
    setClassName,
    getClassName,
    addKey,
    getKey,
    getKeyAt,
    getKeyCount,
    setNameSpaceFromObjectPath,
    setHostAndNameSpaceFromObjectPath,
    getClassQualifier,
    getPropertyQualifier,
    getMethodQualifier,
    getParameterQualifier,
    toString,
};

} // namespace qelo::broker
