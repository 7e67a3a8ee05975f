#include "support/broker/Call.h"

namespace qelo::test {

namespace {

CMPIData getEntry(const CMPIContext* self, const char* name, CMPIStatus* st) {
    Call call("getEntry", self, st);
    call.text(name);
    if (!call.begin()) {
        return call.noData();
    }
    return call.named(call.content<CMPIContext>().entries, name);
}

CMPIData getEntryAt(const CMPIContext* self, CMPICount index, CMPIString** name, CMPIStatus* st) {
    Call call("getEntryAt", self, st);
    call.number(index);
    if (!call.begin()) {
        return call.noDataAndName(name);
    }
    return call.at(call.content<CMPIContext>().entries, index, name);
}

CMPICount getEntryCount(const CMPIContext* self, CMPIStatus* st) {
    Call call("getEntryCount", self, st);
    if (!call.begin()) {
        return 0;
    }
    return static_cast<CMPICount>(call.content<CMPIContext>().entries.size());
}

CMPIStatus addEntry(const CMPIContext* self, const char* name, const CMPIValue* value,
                    CMPIType type) {
    Call call("addEntry", self);
    call.text(name);
    const Value entry = call.value(value, type);
    if (call.begin()) {
        put(call.content<CMPIContext>().entries, name, entry);
    }
    return call.status();
}

} // namespace

const CMPIContextFT* tableContext() {
    static const CMPIContextFT table = {CMPIVersion200,
                                        releaseSlot<CMPIContext>,
                                        cloneSlot<CMPIContext>,
                                        getEntry,
                                        getEntryAt,
                                        getEntryCount,
                                        addEntry};
    return &table;
}

} // namespace qelo::test
