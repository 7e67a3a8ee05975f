#include "support/broker/Call.h"

namespace qelo::test {

namespace {

CMPIData getProperty(const CMPIInstance* self, const char* name, CMPIStatus* st) {
    Call call("getProperty", self, st);
    call.text(name);
    if (!call.begin()) {
        return call.noData();
    }
    return call.named(call.content<CMPIInstance>().visible().properties, name);
}

CMPIData getPropertyAt(const CMPIInstance* self, CMPICount index, CMPIString** name,
                       CMPIStatus* st) {
    Call call("getPropertyAt", self, st);
    call.number(index);
    if (!call.begin()) {
        return call.noDataAndName(name);
    }
    return call.at(call.content<CMPIInstance>().visible().properties, index, name);
}

CMPICount getPropertyCount(const CMPIInstance* self, CMPIStatus* st) {
    Call call("getPropertyCount", self, st);
    if (!call.begin()) {
        return 0;
    }
    return static_cast<CMPICount>(call.content<CMPIInstance>().visible().properties.size());
}

void store(Call& call, const char* name, const Value& value) {
    InstanceContent& instance = call.content<CMPIInstance>();
    if (instance.admits(name)) {
        put(instance.data.properties, name, value);
    }
}

CMPIStatus setProperty(const CMPIInstance* self, const char* name, const CMPIValue* value,
                       CMPIType type) {
    Call call("setProperty", self);
    call.text(name);
    const Value property = call.value(value, type);
    if (call.begin()) {
        store(call, name, property);
    }
    return call.status();
}

CMPIStatus setPropertyWithOrigin(const CMPIInstance* self, const char* name, const CMPIValue* value,
                                 CMPIType type, const char* origin) {
    Call call("setPropertyWithOrigin", self);
    call.text(name);
    const Value property = call.value(value, type);
    call.optional(origin);
    if (call.begin()) {
        store(call, name, property);
    }
    return call.status();
}

CMPIObjectPath* getObjectPath(const CMPIInstance* self, CMPIStatus* st) {
    Call call("getObjectPath", self, st);
    if (!call.begin()) {
        return call.noObject<CMPIObjectPath>();
    }
    return call.state().make<CMPIObjectPath>(call.content<CMPIInstance>().data.path);
}

CMPIStatus setPropertyFilter(const CMPIInstance* self, const char** properties, const char** keys) {
    Call call("setPropertyFilter", self);
    call.list(properties);
    call.list(keys);
    if (!call.begin() || call.state().ignoreFilter) {
        return call.status();
    }
    InstanceContent& instance = call.content<CMPIInstance>();
    instance.filtered = properties != nullptr;
    instance.filter.clear();
    for (; properties != nullptr && *properties != nullptr; ++properties) {
        instance.filter.emplace_back(*properties);
    }
    return call.status();
}

CMPIStatus setObjectPath(const CMPIInstance* self, const CMPIObjectPath* path) {
    Call call("setObjectPath", self);
    call.object(path);
    if (call.begin()) {
        call.content<CMPIInstance>().data.path = Call::contentOf(path);
    }
    return call.status();
}

} // namespace

const CMPIInstanceFT* tableInstance() {
    static const CMPIInstanceFT table = {CMPIVersion200,
                                         releaseSlot<CMPIInstance>,
                                         cloneSlot<CMPIInstance>,
                                         getProperty,
                                         getPropertyAt,
                                         getPropertyCount,
                                         setProperty,
                                         getObjectPath,
                                         setPropertyFilter,
                                         setObjectPath,
                                         setPropertyWithOrigin};
    return &table;
}

} // namespace qelo::test
