// Any CMPI object as its type's name or as text for people.
#pragma once

#include <string>
#include <string_view>

namespace qelo::broker {

// "CMPIInstance" and so on. Refusal with INVALID_HANDLE for null, for a dead object and for
// what is not an object of this broker.
std::string_view objectTypeName(const void* object);

// Whether it is the name of a type of CMPI objects.
bool isObjectTypeName(std::string_view name);

// Debugging text; its form may change. Refusals as objectTypeName().
std::string describeObject(const void* object);

} // namespace qelo::broker
