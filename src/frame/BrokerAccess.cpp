#include "BrokerAccess.h"

#include <platform/TeskCommon.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

const char* textOf(const CMPIString* string) {
    const char* text = isNull(string) ? nullptr : string->ft->getCharPtr(string, nullptr);
    return text != nullptr ? text : "";
}

const char* nameSpaceOf(const CMPIObjectPath* path, CMPIStatus* status) {
    return isNull(path) ? "" : textOf(path->ft->getNameSpace(path, status));
}

const char* classNameOf(const CMPIObjectPath* path, CMPIStatus* status) {
    return isNull(path) ? "" : textOf(path->ft->getClassName(path, status));
}

bool holdsText(const CMPIData& key) {
    constexpr unsigned int unusable = CMPI_nullValue | CMPI_notFound | CMPI_badValue;
    return key.type == CMPI_string && (key.state & unusable) == 0 && !isNull(key.value.string);
}

CMPIStatus makeStatus(const CMPIBroker* broker, CMPIrc code, const char* text) {
    CMPIString* message = nullptr;
    if (broker != nullptr) {
        message = broker->eft->newString(broker, text, nullptr);
    }
    return {code, isNull(message) ? nullptr : message};
}

void setStatus(CMPIStatus* status, const CMPIBroker* broker, CMPIrc code, const char* text) {
    if (status != nullptr) {
        *status = makeStatus(broker, code, text);
    }
}

void traceToBroker(const CMPIBroker* broker, unsigned int level, const char* component,
                   const char* text) {
    if (broker != nullptr) {
        CMTraceMessage(broker, static_cast<CMPILevel>(level), component, text, nullptr);
    }
}

CMPIObjectPath* newBarePath(const CMPIBroker* broker, const CMPIObjectPath* ref,
                            const char* className, CMPIStatus* lookup, CMPIStatus* creation) {
    if (broker == nullptr) {
        return nullptr;
    }
    const char* nameSpace = nameSpaceOf(ref, lookup);
    CMPIObjectPath* path = broker->eft->newObjectPath(broker, nameSpace, className, creation);
    return isNull(path) ? nullptr : path;
}

CMPIObjectPath* newPath(const CMPIBroker* broker, const CMPIObjectPath* ref, const char* className,
                        CMPIStatus* lookup, CMPIStatus* creation) {
    CMPIObjectPath* path = newBarePath(broker, ref, className, lookup, creation);
    if (path != nullptr) {
        place(path, ref, lookup);
    }
    return path;
}

void setNameSpaceFrom(CMPIObjectPath* path, const CMPIObjectPath* ref, CMPIStatus* status) {
    path->ft->setNameSpace(path, nameSpaceOf(ref, status));
}

void place(CMPIObjectPath* path, const CMPIObjectPath* ref, CMPIStatus* status) {
    setNameSpaceFrom(path, ref, status);
    path->ft->setHostname(path, getSystemName().c_str());
}

void addKey(CMPIObjectPath* path, const char* name, const std::string& text) {
    path->ft->addKey(path, name, charsValue(text.c_str()), CMPI_chars);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
