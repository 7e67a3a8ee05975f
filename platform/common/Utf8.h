// UTF-8, decoded strictly; shared by the platform libraries, header only.
//
// Overlong forms, surrogates, values above U+10FFFF and truncated sequences are invalid.
// Every function is pure and may be called from any thread.
#pragma once

#include <unicode/utf8.h>

#include <cstddef>
#include <string_view>

namespace qelo::platform {

// What nextCodePoint gives where the bytes are not UTF-8.
constexpr char32_t kInvalidCodePoint = 0xFFFFFFFF;

// U8_NEXT narrows its intermediate values knowingly.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wconversion"

// The character that starts at `offset`, which must be less than text.size(). Moves `offset`
// past it, or past the bytes that cannot be part of any character.
inline char32_t nextCodePoint(std::string_view text, std::size_t& offset) {
    const char* bytes = text.data();
    const std::size_t size = text.size();
    UChar32 character = U_SENTINEL;
    U8_NEXT(bytes, offset, size, character);
    return character < 0 ? kInvalidCodePoint : static_cast<char32_t>(character);
}

#pragma GCC diagnostic pop

// C0, DEL and C1: characters that drive a terminal or end a line instead of showing.
constexpr bool isControl(char32_t character) {
    return character < 0x20 || (character >= 0x7F && character < 0xA0);
}

} // namespace qelo::platform
