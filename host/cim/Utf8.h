// UTF-8, checked by hand: account data may hold any bytes.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace qelo::cim {

// One character of a text: its code point and how many bytes it takes.
struct Utf8Character {
    char32_t code;
    std::size_t length;
};

// The character that starts at `position` (which must be inside the text). Nothing when the
// bytes there are not well-formed UTF-8: a stray or missing continuation byte, an overlong
// form, a surrogate or a number above U+10FFFF.
std::optional<Utf8Character> decodeUtf8(std::string_view text, std::size_t position);

// The bytes of one character; U+FFFD for what is no character (surrogates, above U+10FFFF).
std::string utf8(char32_t code);
void appendUtf8(std::string& target, char32_t code);

bool isValidUtf8(std::string_view text);

} // namespace qelo::cim
