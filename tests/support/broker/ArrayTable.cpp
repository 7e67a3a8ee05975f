#include "support/broker/Call.h"

namespace qelo::test {

namespace {

CMPICount getSize(const CMPIArray* self, CMPIStatus* st) {
    Call call("getSize", self, st);
    if (!call.begin()) {
        return 0;
    }
    return static_cast<CMPICount>(call.content<CMPIArray>().elements.size());
}

CMPIType getSimpleType(const CMPIArray* self, CMPIStatus* st) {
    Call call("getSimpleType", self, st);
    if (!call.begin()) {
        return CMPI_null;
    }
    return call.content<CMPIArray>().elementType;
}

CMPIData getElementAt(const CMPIArray* self, CMPICount index, CMPIStatus* st) {
    Call call("getElementAt", self, st);
    call.number(index);
    if (!call.begin()) {
        return call.noData();
    }
    const ArrayContent& array = call.content<CMPIArray>();
    if (index < array.elements.size()) {
        return call.data(array.elements[index]);
    }
    call.refuse(CMPI_RC_ERR_NO_SUCH_PROPERTY, "position out of range");
    return call.noData();
}

CMPIStatus setElementAt(const CMPIArray* self, CMPICount index, const CMPIValue* value,
                        CMPIType type) {
    Call call("setElementAt", self);
    call.number(index);
    const Value element = call.value(value, type);
    if (!call.begin()) {
        return call.status();
    }
    ArrayContent& array = call.content<CMPIArray>();
    if (type != array.elementType) {
        call.refuse(CMPI_RC_ERR_TYPE_MISMATCH,
                    typeName(type) + " into an array of " + typeName(array.elementType));
    } else if (index >= array.elements.size()) {
        call.refuse(CMPI_RC_ERR_NO_SUCH_PROPERTY, "position out of range");
    } else {
        array.elements[index] = element;
    }
    return call.status();
}

} // namespace

const CMPIArrayFT* tableArray() {
    static const CMPIArrayFT table = {CMPIVersion200, releaseSlot<CMPIArray>, cloneSlot<CMPIArray>,
                                      getSize,        getSimpleType,          getElementAt,
                                      setElementAt};
    return &table;
}

} // namespace qelo::test
