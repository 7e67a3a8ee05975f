// Typed values from text, for everything that reads them from outside: command lines, XML,
// JSON. Strict: the whole text must be one value of the type.
#pragma once

#include "Value.h"

#include <optional>
#include <string>
#include <string_view>

namespace qelo::cim {

// The intrinsic type of that name ("uint32", "datetime", ...), ignoring case. Nothing for
// other names, and for "reference" and "instance", whose values have no form as one text.
std::optional<Type> typeOfName(std::string_view name);

// The value that `text` denotes in `type`:
//   integers   decimal with an optional sign, or hexadecimal as 0x1F; within the type's range
//   boolean    true or false, ignoring case
//   real32/64  decimal with optional fraction and exponent; INF, -INF, NaN; within range
//   char16     exactly one character up to U+FFFF
//   string     the text itself
//   datetime   the 25 characters
// On failure: nothing, and `error` says what was expected. Blanks are not skipped.
std::optional<Value> parseValue(Type type, std::string_view text, std::string& error);

} // namespace qelo::cim
