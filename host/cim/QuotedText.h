// Text in double quotes, as MOF (DMTF DSP0004) and the printed form of object paths write it.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace qelo::cim {

// Appends `text` in double quotes: \" and \\ escaped, control characters as \b \t \n \f \r or
// as \x with four hexadecimal digits, so that the result never leaves its line. All other
// bytes, valid UTF-8 or not, stay as they are.
void appendQuoted(std::string& target, std::string_view text);
std::string quotedText(std::string_view text);

// Reads a quoted text that starts at `text[position]` (which must be the opening quote) and
// moves `position` behind the closing quote. The escapes above, \' and \x with one to four
// hexadecimal digits are understood; \x0 and halves of surrogate pairs are refused, so that
// the result is never cut short and never becomes invalid UTF-8 through an escape.
// On failure: nothing, `position` stands at the offending byte, `error` says what is wrong.
std::optional<std::string> readQuoted(std::string_view text, std::size_t& position,
                                      std::string& error);

} // namespace qelo::cim
