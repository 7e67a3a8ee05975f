// CMPI values: checking what a provider passes as value and type, and copying it into an
// object. Text of type CMPI_chars becomes a CMPI_string, which is what readers look for.
#pragma once

#include "Objects.h"

namespace qelo::broker {

// What a value is for; the types that are allowed differ.
enum class ValueUse {
    Any,     // properties, arguments, results, array elements
    Key,     // keys of object paths: no arrays, no embedded objects
    Context, // context entries: raw pointers as well
};

// CMPI_string for CMPI_chars and CMPI_charsptr, with or without the array bit; every other
// type as it is.
CMPIType storedType(CMPIType type);

// Whether arrays of that type can be made.
bool isElementType(CMPIType type);

// A deep copy in `arena` of what a slot got as `value` and `type`; a null `value` is CIM NULL.
// Refusal: INVALID_DATA_TYPE for a type that is unknown or not allowed here, TYPE_MISMATCH for
// an array of another element type, INVALID_HANDLE for a dead object, FAILED for a nesting
// that is too deep.
CMPIData storeData(Arena& arena, const CMPIValue* value, CMPIType type,
                   ValueUse use = ValueUse::Any);

// A deep copy of data that is already well formed.
CMPIData copyData(Arena& arena, const CMPIData& data, int depth = 0);

CMPIData nullData(CMPIType type);

} // namespace qelo::broker
