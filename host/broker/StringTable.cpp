#include "Slot.h"

namespace qelo::broker {
namespace {

const char* getCharPtr(const CMPIString* self, CMPIStatus* st) {
    return slot<const char*>(st, nullptr, [&] { return alive<StringObject>(self).text(); });
}

} // namespace

const CMPIStringFT StringObject::table = {
    CMPIVersion200,
    releaseSlot<StringObject>,
    cloneSlot<StringObject>,
    getCharPtr,
};

} // namespace qelo::broker
