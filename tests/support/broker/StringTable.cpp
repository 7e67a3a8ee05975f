#include "support/broker/Call.h"

namespace qelo::test {

namespace {

const char* getCharPtr(const CMPIString* self, CMPIStatus* st) {
    Call call("getCharPtr", self, st);
    if (!call.begin()) {
        return nullptr;
    }
    return call.content<CMPIString>().c_str();
}

} // namespace

const CMPIStringFT* tableString() {
    static const CMPIStringFT table = {CMPIVersion200, releaseSlot<CMPIString>,
                                       cloneSlot<CMPIString>, getCharPtr};
    return &table;
}

} // namespace qelo::test
