#include "Slot.h"

namespace qelo::broker {
namespace {

CMPIData getNext(const CMPIEnumeration* self, CMPIStatus* st) {
    return slot(st, absentData(), [&] {
        EnumerationObject& enumeration = alive<EnumerationObject>(self);
        if (enumeration.position >= enumeration.elements->size) {
            throw Refusal{CMPI_RC_NO_MORE_ELEMENTS};
        }
        return enumeration.elements->elements[enumeration.position++];
    });
}

CMPIBoolean hasNext(const CMPIEnumeration* self, CMPIStatus* st) {
    return slot<CMPIBoolean>(st, 0, [&] {
        const EnumerationObject& enumeration = alive<EnumerationObject>(self);
        return enumeration.position < enumeration.elements->size;
    });
}

CMPIArray* toArray(const CMPIEnumeration* self, CMPIStatus* st) {
    return slot<CMPIArray*>(st, nullptr,
                            [&] { return &alive<EnumerationObject>(self).elements->cmpi; });
}

} // namespace

const CMPIEnumerationFT EnumerationObject::table = {
    CMPIVersion200, releaseSlot<EnumerationObject>, cloneSlot<EnumerationObject>, getNext, hasNext,
    toArray,
};

} // namespace qelo::broker
