// Texts as clients may see them.
#pragma once

#include <string>
#include <string_view>

namespace qelo::nodes {

bool isValidUtf8(std::string_view text);

// The text with each ill-formed sequence replaced by U+FFFD.
std::string validUtf8(std::string_view text);

// Valid UTF-8 without control characters and line separators: each of their bytes becomes
// "%" and two hexadecimal digits. The same text gives the same result.
std::string printable(std::string_view text);

// The bytes of a name as one step of a node path: letters, digits and "-._~" stay, every
// other byte becomes "%" and two hexadecimal digits. Different names give different steps.
std::string pathStep(std::string_view name);

// True when `path` continues `ancestor` after a "/".
bool liesUnder(std::string_view path, std::string_view ancestor);

} // namespace qelo::nodes
