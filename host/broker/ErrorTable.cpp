#include "Data.h"
#include "Slot.h"

namespace qelo::broker {
namespace {

// One instance of these for each attribute: a pointer to the member is its argument.
template <auto Member> auto getPlain(const CMPIError* self, CMPIStatus* st) {
    using Value = std::decay_t<decltype(std::declval<ErrorObject>().*Member)>;
    return slot<Value>(st, Value{}, [&] { return alive<ErrorObject>(self).*Member; });
}

template <StringObject* ErrorObject::*Member>
CMPIString* getText(const CMPIError* self, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr, [&]() -> CMPIString* {
        StringObject* text = alive<ErrorObject>(self).*Member;
        return text ? &text->cmpi : nullptr;
    });
}

template <ArrayObject* ErrorObject::*Member>
CMPIArray* getTexts(const CMPIError* self, CMPIStatus* st) {
    return slot<CMPIArray*>(st, nullptr, [&]() -> CMPIArray* {
        ArrayObject* texts = alive<ErrorObject>(self).*Member;
        return texts ? &texts->cmpi : nullptr;
    });
}

template <auto Member, class Value> CMPIStatus setPlain(const CMPIError* self, const Value value) {
    return statusSlot([&] { alive<ErrorObject>(self).*Member = value; });
}

template <StringObject* ErrorObject::*Member>
CMPIStatus setText(const CMPIError* self, const char* text) {
    return statusSlot([&] {
        ErrorObject& error = alive<ErrorObject>(self);
        error.*Member = text ? newString(*error.arena, text, Ownership::Contained) : nullptr;
    });
}

template <ArrayObject* ErrorObject::*Member>
CMPIStatus setTexts(const CMPIError* self, const CMPIArray* texts) {
    return statusSlot([&] {
        ErrorObject& error = alive<ErrorObject>(self);
        if (!texts) {
            error.*Member = nullptr;
            return;
        }
        const ArrayObject& array = alive<ArrayObject>(texts);
        if (array.elementType != CMPI_string) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        error.*Member = copyOf(array, *error.arena, Ownership::Contained);
    });
}

using E = ErrorObject;

} // namespace

const CMPIErrorFT ErrorObject::table = {
    CMPIVersion200,
    releaseSlot<E>,
    cloneSlot<E>,
    getPlain<&E::errorType>,
    getText<&E::otherErrorType>,
    getText<&E::owningEntity>,
    getText<&E::messageId>,
    getText<&E::message>,
    getPlain<&E::severity>,
    getPlain<&E::probableCause>,
    getText<&E::probableCauseDescription>,
    getTexts<&E::recommendedActions>,
    getText<&E::errorSource>,
    getPlain<&E::sourceFormat>,
    getText<&E::otherSourceFormat>,
    getPlain<&E::statusCode>,
    getText<&E::statusCodeDescription>,
    getTexts<&E::messageArguments>,
    setPlain<&E::errorType, CMPIErrorType>,
    setText<&E::otherErrorType>,
    setText<&E::probableCauseDescription>,
    setTexts<&E::recommendedActions>,
    setText<&E::errorSource>,
    setPlain<&E::sourceFormat, CMPIErrorSrcFormat>,
    setText<&E::otherSourceFormat>,
    setText<&E::statusCodeDescription>,
    setTexts<&E::messageArguments>,
};

} // namespace qelo::broker
