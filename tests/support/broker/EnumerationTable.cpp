#include "support/broker/Call.h"

namespace qelo::test {

namespace {

// Also for an enumeration that is not to be touched.
CMPIType elementTypeOf(const CMPIEnumeration* self) {
    const Object* const object = BrokerState::objectAt(self);
    if (object == nullptr || object->kind != Kind::Enumeration || object->life == Life::Ended) {
        return CMPI_ref;
    }
    const auto& content = static_cast<const ObjectOf<CMPIEnumeration>*>(object)->content;
    return content == nullptr ? CMPIType{CMPI_ref} : content->elementType;
}

CMPIData getNext(const CMPIEnumeration* self, CMPIStatus* st) {
    Call call("getNext", self, st);
    if (!call.begin()) {
        return call.noData(elementTypeOf(self));
    }
    EnumerationContent& enumeration = call.content<CMPIEnumeration>();
    if (enumeration.next < enumeration.elements.size()) {
        return call.data(enumeration.elements[enumeration.next++]);
    }
    call.fail(CMPI_RC_NO_MORE_ELEMENTS);
    return call.noData(enumeration.elementType);
}

CMPIBoolean hasNext(const CMPIEnumeration* self, CMPIStatus* st) {
    Call call("hasNext", self, st);
    if (!call.begin()) {
        return 0;
    }
    const EnumerationContent& enumeration = call.content<CMPIEnumeration>();
    return enumeration.next < enumeration.elements.size() ? 1 : 0;
}

CMPIArray* toArray(const CMPIEnumeration* self, CMPIStatus* st) {
    Call call("toArray", self, st);
    if (!call.begin()) {
        return call.noObject<CMPIArray>();
    }
    const EnumerationContent& enumeration = call.content<CMPIEnumeration>();
    return call.state().make<CMPIArray>({enumeration.elementType, enumeration.elements});
}

} // namespace

const CMPIEnumerationFT* tableEnumeration() {
    static const CMPIEnumerationFT table = {
        CMPIVersion200, releaseSlot<CMPIEnumeration>, cloneSlot<CMPIEnumeration>, getNext, hasNext,
        toArray};
    return &table;
}

} // namespace qelo::test
