#include "Data.h"
#include "Slot.h"

namespace qelo::broker {
namespace {

CMPIData& elementAt(const ArrayObject& array, CMPICount index) {
    if (index >= array.size) {
        throw Refusal{CMPI_RC_ERR_NO_SUCH_PROPERTY};
    }
    return array.elements[index];
}

CMPICount getSize(const CMPIArray* self, CMPIStatus* st) {
    return slot<CMPICount>(st, 0, [&] { return alive<ArrayObject>(self).size; });
}

CMPIType getSimpleType(const CMPIArray* self, CMPIStatus* st) {
    return slot<CMPIType>(st, CMPI_null, [&] { return alive<ArrayObject>(self).elementType; });
}

CMPIData getElementAt(const CMPIArray* self, CMPICount index, CMPIStatus* st) {
    return slot(st, absentData(), [&] { return elementAt(alive<ArrayObject>(self), index); });
}

CMPIStatus setElementAt(const CMPIArray* self, CMPICount index, const CMPIValue* value,
                        CMPIType type) {
    return statusSlot([&] {
        ArrayObject& array = alive<ArrayObject>(self);
        CMPIData& element = elementAt(array, index);
        if (type == CMPI_null) {
            element = nullData(array.elementType);
            return;
        }
        if (storedType(type) != array.elementType) {
            throw Refusal{CMPI_RC_ERR_TYPE_MISMATCH};
        }
        element = storeData(*array.arena, value, type);
    });
}

} // namespace

const CMPIArrayFT ArrayObject::table = {
    CMPIVersion200,         releaseSlot<ArrayObject>,
    cloneSlot<ArrayObject>, getSize,
    getSimpleType,          getElementAt,
    setElementAt,
};

} // namespace qelo::broker
