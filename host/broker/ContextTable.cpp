#include "Data.h"
#include "EntrySlots.h"

namespace qelo::broker {
namespace {

CMPIData getEntry(const CMPIContext* self, const char* name, CMPIStatus* st) {
    return slot(st, absentData(),
                [&] { return entryNamed(alive<ContextObject>(self).entries, name).data; });
}

CMPIData getEntryAt(const CMPIContext* self, CMPICount index, CMPIString** name, CMPIStatus* st) {
    return positionSlot(
        name, st, [&] { return entryAt(alive<ContextObject>(self).entries, index, name).data; });
}

CMPICount getEntryCount(const CMPIContext* self, CMPIStatus* st) {
    return slot<CMPICount>(st, 0, [&] { return countOf(alive<ContextObject>(self).entries); });
}

CMPIStatus addEntry(const CMPIContext* self, const char* name, const CMPIValue* value,
                    CMPIType type) {
    return statusSlot([&] {
        ContextObject& context = alive<ContextObject>(self);
        const std::string_view given = givenName(name);
        context.entries.set(*context.arena, given,
                            storeData(*context.arena, value, type, ValueUse::Context));
    });
}

} // namespace

const CMPIContextFT ContextObject::table = {
    CMPIVersion200,
    releaseSlot<ContextObject>,
    cloneSlot<ContextObject>,
    getEntry,
    getEntryAt,
    getEntryCount,
    addEntry,
};

} // namespace qelo::broker
