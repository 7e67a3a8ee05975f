// CIM values and instances in the language of MOF (DMTF DSP0004).
#pragma once

#include <cim/Instance.h>

#include <string>
#include <string_view>

namespace qelo::cli {

// A string literal. Characters that are not displayable are written as \x escapes; bytes
// that are not UTF-8, which MOF cannot hold, become U+FFFD.
std::string mofString(std::string_view text);

// An initialiser: literals, arrays in braces, NULL. References are the quoted text of their
// path, embedded instances the quoted text of their own MOF. MOF has no form for infinite
// reals and NaN: those become NULL.
std::string mofValue(const cim::Value& value);

// "instance of CLASS { ... };" with one property a line, ending in a new line.
std::string mofInstance(const cim::Instance& instance);

} // namespace qelo::cli
