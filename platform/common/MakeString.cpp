#include "platform/TeskCommon.h"

namespace Tesk {
namespace {

constexpr char32_t kReplacement = 0xFFFD;

bool isCharacter(char32_t value) { return value <= 0x10FFFF && (value < 0xD800 || value > 0xDFFF); }

// The byte that carries the low six bits of `value`, after the first byte of a sequence.
char continuation(char32_t value) { return static_cast<char>(0x80 | (value & 0x3F)); }

void append(std::string& text, char32_t character) {
    if (character < 0x80) {
        text += static_cast<char>(character);
        return;
    }
    if (character < 0x800) {
        text += static_cast<char>(0xC0 | (character >> 6));
    } else {
        if (character < 0x10000) {
            text += static_cast<char>(0xE0 | (character >> 12));
        } else {
            text += static_cast<char>(0xF0 | (character >> 18));
            text += continuation(character >> 12);
        }
        text += continuation(character >> 6);
    }
    text += continuation(character);
}

} // namespace

std::string make_string(const std::wstring& text) {
    std::string narrow;
    narrow.reserve(text.size());
    for (const wchar_t wide : text) {
        const auto value = static_cast<char32_t>(wide);
        append(narrow, isCharacter(value) ? value : kReplacement);
    }
    return narrow;
}

} // namespace Tesk
