#include "Slot.h"

#include <cim/DateTime.h>

namespace qelo::broker {
namespace {

cim::DateTime pointOf(const CMPIDateTime* self) {
    const std::optional<cim::DateTime> time =
        cim::DateTime::parse(alive<DateTimeObject>(self).text);
    if (!time) {
        throw Refusal{CMPI_RC_ERR_FAILED};
    }
    return *time;
}

CMPIUint64 getBinaryFormat(const CMPIDateTime* self, CMPIStatus* st) {
    return slot<CMPIUint64>(st, 0, [&] { return pointOf(self).microseconds(); });
}

CMPIString* getStringFormat(const CMPIDateTime* self, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr, [&] {
        DateTimeObject& time = alive<DateTimeObject>(self);
        return &newString(*time.arena, time.text, Ownership::Contained)->cmpi;
    });
}

CMPIBoolean isInterval(const CMPIDateTime* self, CMPIStatus* st) {
    return slot<CMPIBoolean>(st, 0, [&] { return pointOf(self).isInterval(); });
}

} // namespace

const CMPIDateTimeFT DateTimeObject::table = {
    CMPIVersion200,
    releaseSlot<DateTimeObject>,
    cloneSlot<DateTimeObject>,
    getBinaryFormat,
    getStringFormat,
    isInterval,
};

} // namespace qelo::broker
