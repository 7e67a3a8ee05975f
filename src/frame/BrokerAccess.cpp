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

CMPIObjectPath* newPath(const CMPIBroker* broker, const CMPIObjectPath* ref, const char* className,
                        CMPIStatus* lookup, CMPIStatus* creation) {
    if (broker == nullptr) {
        return nullptr;
    }
    const char* nameSpace = nameSpaceOf(ref, lookup);
    CMPIObjectPath* path = broker->eft->newObjectPath(broker, nameSpace, className, creation);
    if (isNull(path)) {
        return nullptr;
    }
    path->ft->setNameSpace(path, nameSpace);
    path->ft->setHostname(path, getSystemName().c_str());
    return path;
}

void setNameSpaceFrom(CMPIObjectPath* path, const CMPIObjectPath* ref, CMPIStatus* status) {
    path->ft->setNameSpace(path, nameSpaceOf(ref, status));
}

void addKeys(CMPIObjectPath* path, const std::vector<KeyText>& keys) {
    for (const KeyText& key : keys) {
        path->ft->addKey(path, key.name, charsValue(key.text.c_str()), CMPI_chars);
    }
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
