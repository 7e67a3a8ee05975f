#include "Data.h"
#include "EntrySlots.h"
#include "Instances.h"

namespace qelo::broker {
namespace {

CMPIData getProperty(const CMPIInstance* self, const char* name, CMPIStatus* st) {
    return slot(st, absentData(),
                [&] { return entryNamed(alive<InstanceObject>(self).properties, name).data; });
}

CMPIData getPropertyAt(const CMPIInstance* self, CMPICount index, CMPIString** name,
                       CMPIStatus* st) {
    return positionSlot(name, st, [&] {
        return entryAt(alive<InstanceObject>(self).properties, index, name).data;
    });
}

CMPICount getPropertyCount(const CMPIInstance* self, CMPIStatus* st) {
    return slot<CMPICount>(st, 0, [&] { return countOf(alive<InstanceObject>(self).properties); });
}

CMPIStatus setPropertyWithOrigin(const CMPIInstance* self, const char* name, const CMPIValue* value,
                                 CMPIType type, const char* origin) {
    return statusSlot([&] {
        InstanceObject& instance = alive<InstanceObject>(self);
        const std::string_view given = givenName(name);
        Arena& arena = *instance.arena;
        StringObject* from = origin ? arena.name(origin, nameHash(origin)) : nullptr;
        setProperty(instance, given, storeData(arena, value, type), from);
    });
}

CMPIStatus setPropertyPlain(const CMPIInstance* self, const char* name, const CMPIValue* value,
                            CMPIType type) {
    return setPropertyWithOrigin(self, name, value, type, nullptr);
}

CMPIObjectPath* getObjectPath(const CMPIInstance* self, CMPIStatus* st) {
    return slot<CMPIObjectPath*>(st, nullptr,
                                 [&] { return &alive<InstanceObject>(self).path->cmpi; });
}

CMPIStatus setFilter(const CMPIInstance* self, const char** properties, const char** keys) {
    return statusSlot([&] { setPropertyFilter(alive<InstanceObject>(self), properties, keys); });
}

CMPIStatus setPath(const CMPIInstance* self, const CMPIObjectPath* path) {
    return statusSlot(
        [&] { setObjectPath(alive<InstanceObject>(self), alive<ObjectPathObject>(path)); });
}

} // namespace

const CMPIInstanceFT InstanceObject::table = {
    CMPIVersion200,
    releaseSlot<InstanceObject>,
    cloneSlot<InstanceObject>,
    getProperty,
    getPropertyAt,
    getPropertyCount,
    setPropertyPlain,
    getObjectPath,
    setFilter,
    setPath,
    setPropertyWithOrigin,
};

} // namespace qelo::broker
