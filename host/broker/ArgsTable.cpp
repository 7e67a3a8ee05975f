#include "Data.h"
#include "EntrySlots.h"

namespace qelo::broker {
namespace {

CMPIStatus addArg(const CMPIArgs* self, const char* name, const CMPIValue* value, CMPIType type) {
    return statusSlot([&] {
        ArgsObject& args = alive<ArgsObject>(self);
        const std::string_view given = givenName(name);
        args.arguments.set(*args.arena, given, storeData(*args.arena, value, type));
    });
}

CMPIData getArg(const CMPIArgs* self, const char* name, CMPIStatus* st) {
    return slot(st, absentData(),
                [&] { return entryNamed(alive<ArgsObject>(self).arguments, name).data; });
}

CMPIData getArgAt(const CMPIArgs* self, CMPICount index, CMPIString** name, CMPIStatus* st) {
    return positionSlot(
        name, st, [&] { return entryAt(alive<ArgsObject>(self).arguments, index, name).data; });
}

CMPICount getArgCount(const CMPIArgs* self, CMPIStatus* st) {
    return slot<CMPICount>(st, 0, [&] { return countOf(alive<ArgsObject>(self).arguments); });
}

} // namespace

const CMPIArgsFT ArgsObject::table = {
    CMPIVersion200, releaseSlot<ArgsObject>, cloneSlot<ArgsObject>, addArg, getArg, getArgAt,
    getArgCount,
};

} // namespace qelo::broker
