#include "Utf8.h"

namespace qelo::cim {
namespace {

constexpr char32_t kReplacement = 0xFFFD;

bool isSurrogate(char32_t code) { return code >= 0xD800 && code <= 0xDFFF; }

// What a first byte promises: the length of the character, the bits that the byte itself
// contributes and the lowest code point for which that length is the right one.
struct FirstByte {
    std::size_t length;
    char32_t bits;
    char32_t lowest;
};

std::optional<FirstByte> firstByteOf(unsigned char byte) {
    if (byte < 0x80) {
        return FirstByte{1, byte, 0};
    }
    if (byte >= 0xC0 && byte < 0xE0) {
        return FirstByte{2, byte & 0x1FU, 0x80};
    }
    if (byte >= 0xE0 && byte < 0xF0) {
        return FirstByte{3, byte & 0x0FU, 0x800};
    }
    if (byte >= 0xF0 && byte < 0xF8) {
        return FirstByte{4, byte & 0x07U, 0x10000};
    }
    return std::nullopt;
}

} // namespace

std::optional<Utf8Character> decodeUtf8(std::string_view text, std::size_t position) {
    const auto first = firstByteOf(static_cast<unsigned char>(text[position]));
    if (!first || first->length > text.size() - position) {
        return std::nullopt;
    }
    char32_t code = first->bits;
    for (std::size_t i = 1; i < first->length; ++i) {
        const auto byte = static_cast<unsigned char>(text[position + i]);
        if ((byte & 0xC0) != 0x80) {
            return std::nullopt;
        }
        code = (code << 6) | (byte & 0x3FU);
    }
    if (code < first->lowest || code > 0x10FFFF || isSurrogate(code)) {
        return std::nullopt;
    }
    return Utf8Character{code, first->length};
}

void appendUtf8(std::string& target, char32_t code) {
    if (code > 0x10FFFF || isSurrogate(code)) {
        code = kReplacement;
    }
    const auto tail = [&](int shift) {
        target += static_cast<char>(0x80 | ((code >> shift) & 0x3F));
    };
    if (code < 0x80) {
        target += static_cast<char>(code);
    } else if (code < 0x800) {
        target += static_cast<char>(0xC0 | (code >> 6));
        tail(0);
    } else if (code < 0x10000) {
        target += static_cast<char>(0xE0 | (code >> 12));
        tail(6);
        tail(0);
    } else {
        target += static_cast<char>(0xF0 | (code >> 18));
        tail(12);
        tail(6);
        tail(0);
    }
}

std::string utf8(char32_t code) {
    std::string text;
    appendUtf8(text, code);
    return text;
}

bool isValidUtf8(std::string_view text) {
    for (std::size_t position = 0; position < text.size();) {
        const auto character = decodeUtf8(text, position);
        if (!character) {
            return false;
        }
        position += character->length;
    }
    return true;
}

} // namespace qelo::cim
