// Between recorded values and CMPI values.
#pragma once

#include "support/broker/Call.h"

namespace qelo::test {

// A scalar, a text, a date, a path, an instance, or an array of one of them.
bool isKnownType(CMPIType type);

// A copy of what a provider passed as value and type, NULL for a NULL value pointer. What is
// wrong with it is a violation of the call and makes it fail; the result is then NULL.
Value fromCmpi(Call& call, const CMPIValue* value, CMPIType type);

// The value as a provider reads it, with new objects for texts, paths and the like. Texts
// are CMPI_string.
CMPIData toCmpi(BrokerState& state, const Value& value);

} // namespace qelo::test
