#include "support/broker/Call.h"
#include "support/broker/DateTimeText.h"

namespace qelo::test {

namespace {

CMPIUint64 getBinaryFormat(const CMPIDateTime* self, CMPIStatus* st) {
    Call call("getBinaryFormat", self, st);
    if (!call.begin()) {
        return 0;
    }
    // A test may have made a date of any text.
    const std::string& text = call.content<CMPIDateTime>().text;
    if (isDateTimeText(text)) {
        return binaryOfDateTimeText(text);
    }
    call.fail(CMPI_RC_ERR_FAILED);
    return 0;
}

CMPIString* getStringFormat(const CMPIDateTime* self, CMPIStatus* st) {
    Call call("getStringFormat", self, st);
    if (!call.begin()) {
        return call.noObject<CMPIString>();
    }
    return call.string(call.content<CMPIDateTime>().text);
}

CMPIBoolean isInterval(const CMPIDateTime* self, CMPIStatus* st) {
    Call call("isInterval", self, st);
    if (!call.begin()) {
        return 0;
    }
    return isIntervalText(call.content<CMPIDateTime>().text) ? 1 : 0;
}

} // namespace

const CMPIDateTimeFT* tableDateTime() {
    static const CMPIDateTimeFT table = {CMPIVersion200,          releaseSlot<CMPIDateTime>,
                                         cloneSlot<CMPIDateTime>, getBinaryFormat,
                                         getStringFormat,         isInterval};
    return &table;
}

} // namespace qelo::test
