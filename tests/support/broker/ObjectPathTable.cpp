#include "support/broker/Call.h"

namespace qelo::test {

namespace {

CMPIStatus setText(const char* slot, const CMPIObjectPath* self, std::string Path::*member,
                   const char* text) {
    Call call(slot, self);
    call.text(text);
    if (call.begin()) {
        call.content<CMPIObjectPath>().*member = text;
    }
    return call.status();
}

CMPIString* getText(const char* slot, const CMPIObjectPath* self, std::string Path::*member,
                    CMPIStatus* st) {
    Call call(slot, self, st);
    if (!call.begin()) {
        return call.noObject<CMPIString>();
    }
    return call.string(call.content<CMPIObjectPath>().*member);
}

CMPIStatus setNameSpace(const CMPIObjectPath* self, const char* ns) {
    return setText("setNameSpace", self, &Path::nameSpace, ns);
}
CMPIString* getNameSpace(const CMPIObjectPath* self, CMPIStatus* st) {
    return getText("getNameSpace", self, &Path::nameSpace, st);
}
CMPIStatus setHostname(const CMPIObjectPath* self, const char* host) {
    return setText("setHostname", self, &Path::host, host);
}
CMPIString* getHostname(const CMPIObjectPath* self, CMPIStatus* st) {
    return getText("getHostname", self, &Path::host, st);
}
CMPIStatus setClassName(const CMPIObjectPath* self, const char* className) {
    return setText("setClassName", self, &Path::className, className);
}
CMPIString* getClassName(const CMPIObjectPath* self, CMPIStatus* st) {
    return getText("getClassName", self, &Path::className, st);
}

bool isKeyType(CMPIType type) { return (type & CMPI_ARRAY) == 0 && type != CMPI_instance; }

CMPIStatus addKey(const CMPIObjectPath* self, const char* name, const CMPIValue* value,
                  CMPIType type) {
    Call call("addKey", self);
    call.text(name);
    if (!isKeyType(type)) {
        call.refuse(CMPI_RC_ERR_INVALID_DATA_TYPE, typeName(type) + " as key");
    }
    if (value == nullptr) {
        call.refuse(CMPI_RC_ERR_INVALID_PARAMETER, "NULL as key");
    }
    const Value key = call.value(value, type);
    if (call.begin()) {
        put(call.content<CMPIObjectPath>().keys, name, key);
    }
    return call.status();
}

CMPIData getKey(const CMPIObjectPath* self, const char* name, CMPIStatus* st) {
    Call call("getKey", self, st);
    call.text(name);
    if (!call.begin()) {
        return call.noData();
    }
    return call.named(call.content<CMPIObjectPath>().keys, name, CMPI_keyValue);
}

CMPIData getKeyAt(const CMPIObjectPath* self, CMPICount index, CMPIString** name, CMPIStatus* st) {
    Call call("getKeyAt", self, st);
    call.number(index);
    if (!call.begin()) {
        return call.noDataAndName(name);
    }
    return call.at(call.content<CMPIObjectPath>().keys, index, name, CMPI_keyValue);
}

CMPICount getKeyCount(const CMPIObjectPath* self, CMPIStatus* st) {
    Call call("getKeyCount", self, st);
    if (!call.begin()) {
        return 0;
    }
    return static_cast<CMPICount>(call.content<CMPIObjectPath>().keys.size());
}

CMPIStatus setNameSpaceFromObjectPath(const CMPIObjectPath* self, const CMPIObjectPath* source) {
    Call call("setNameSpaceFromObjectPath", self);
    call.object(source);
    if (call.begin()) {
        call.content<CMPIObjectPath>().nameSpace = Call::contentOf(source).nameSpace;
        call.content<CMPIObjectPath>().className = Call::contentOf(source).className;
    }
    return call.status();
}

CMPIStatus setHostAndNameSpaceFromObjectPath(const CMPIObjectPath* self,
                                             const CMPIObjectPath* source) {
    Call call("setHostAndNameSpaceFromObjectPath", self);
    call.object(source);
    if (call.begin()) {
        call.content<CMPIObjectPath>().host = Call::contentOf(source).host;
        call.content<CMPIObjectPath>().nameSpace = Call::contentOf(source).nameSpace;
        call.content<CMPIObjectPath>().className = Call::contentOf(source).className;
    }
    return call.status();
}

CMPIData noQualifier(Call& call) {
    if (call.begin()) {
        call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return call.noData();
}

CMPIData getClassQualifier(const CMPIObjectPath* self, const char* qualifier, CMPIStatus* st) {
    Call call("getClassQualifier", self, st);
    call.text(qualifier);
    return noQualifier(call);
}

CMPIData getPropertyQualifier(const CMPIObjectPath* self, const char* property,
                              const char* qualifier, CMPIStatus* st) {
    Call call("getPropertyQualifier", self, st);
    call.text(property);
    call.text(qualifier);
    return noQualifier(call);
}

CMPIData getMethodQualifier(const CMPIObjectPath* self, const char* method, const char* qualifier,
                            CMPIStatus* st) {
    Call call("getMethodQualifier", self, st);
    call.text(method);
    call.text(qualifier);
    return noQualifier(call);
}

CMPIData getParameterQualifier(const CMPIObjectPath* self, const char* method,
                               const char* parameter, const char* qualifier, CMPIStatus* st) {
    Call call("getParameterQualifier", self, st);
    call.text(method);
    call.text(parameter);
    call.text(qualifier);
    return noQualifier(call);
}

CMPIString* toString(const CMPIObjectPath* self, CMPIStatus* st) {
    Call call("toString", self, st);
    if (!call.begin()) {
        return call.noObject<CMPIString>();
    }
    return call.string(call.content<CMPIObjectPath>().toString());
}

} // namespace

const CMPIObjectPathFT* tableObjectPath() {
    static const CMPIObjectPathFT table = {CMPIVersion200,
                                           releaseSlot<CMPIObjectPath>,
                                           cloneSlot<CMPIObjectPath>,
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
                                           toString};
    return &table;
}

} // namespace qelo::test
