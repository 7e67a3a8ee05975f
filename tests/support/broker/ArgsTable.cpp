#include "support/broker/Call.h"

namespace qelo::test {

namespace {

CMPIStatus addArg(const CMPIArgs* self, const char* name, const CMPIValue* value, CMPIType type) {
    Call call("addArg", self);
    call.text(name);
    const Value argument = call.value(value, type);
    if (call.begin()) {
        put(call.content<CMPIArgs>().values, name, argument);
    }
    return call.status();
}

CMPIData getArg(const CMPIArgs* self, const char* name, CMPIStatus* st) {
    Call call("getArg", self, st);
    call.text(name);
    if (!call.begin()) {
        return call.noData();
    }
    return call.named(call.content<CMPIArgs>().values, name);
}

CMPIData getArgAt(const CMPIArgs* self, CMPICount index, CMPIString** name, CMPIStatus* st) {
    Call call("getArgAt", self, st);
    call.number(index);
    if (!call.begin()) {
        return call.noDataAndName(name);
    }
    return call.at(call.content<CMPIArgs>().values, index, name);
}

CMPICount getArgCount(const CMPIArgs* self, CMPIStatus* st) {
    Call call("getArgCount", self, st);
    if (!call.begin()) {
        return 0;
    }
    return static_cast<CMPICount>(call.content<CMPIArgs>().values.size());
}

} // namespace

const CMPIArgsFT* tableArgs() {
    static const CMPIArgsFT table = {
        CMPIVersion200, releaseSlot<CMPIArgs>, cloneSlot<CMPIArgs>, addArg, getArg, getArgAt,
        getArgCount};
    return &table;
}

} // namespace qelo::test
