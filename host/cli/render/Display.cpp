#include "Display.h"

#include <cim/Utf8.h>

#include <fmt/format.h>
#include <unicode/uchar.h>

#include <algorithm>

namespace qelo::cli {
namespace {

constexpr std::string_view kEllipsis = "…";

bool isPlainAscii(char c) { return c >= 0x20 && c < 0x7f; }

std::size_t widthOf(char32_t code) {
    const auto point = static_cast<UChar32>(code);
    const int type = u_charType(point);
    const int width = u_getIntPropertyValue(point, UCHAR_EAST_ASIAN_WIDTH);
    // The vowels and final consonants of decomposed Korean join the syllable before them.
    const bool joins = type == U_NON_SPACING_MARK || type == U_ENCLOSING_MARK ||
                       (code >= 0x1160 && code <= 0x11FF);
    if (joins) {
        return 0;
    }
    return width == U_EA_WIDE || width == U_EA_FULLWIDTH ? 2 : 1;
}

std::string escapedCharacter(char32_t code) {
    switch (code) {
    case '\n':
        return "\\n";
    case '\t':
        return "\\t";
    case '\r':
        return "\\r";
    default:
        return fmt::format(code > 0xFFFF ? "\\U{:08X}" : "\\x{:04X}",
                           static_cast<unsigned int>(code));
    }
}

// Calls `visit(code, bytes)` for every character of a text; of malformed bytes, each one is
// visited by itself as U+FFFD.
template <typename Visit> void forEachCharacter(std::string_view text, Visit visit) {
    for (std::size_t position = 0; position < text.size();) {
        const auto character = cim::decodeUtf8(text, position);
        const std::size_t length = character ? character->length : 1;
        visit(character ? character->code : U'\xFFFD', text.substr(position, length));
        position += length;
    }
}

} // namespace

bool isDisplayable(char32_t code) {
    switch (u_charType(static_cast<UChar32>(code))) {
    case U_UNASSIGNED:
    case U_CONTROL_CHAR:
    case U_FORMAT_CHAR:
    case U_PRIVATE_USE_CHAR:
    case U_SURROGATE:
    case U_LINE_SEPARATOR:
    case U_PARAGRAPH_SEPARATOR:
        return false;
    default:
        return true;
    }
}

bool isDisplayable(std::string_view text) {
    for (std::size_t position = 0; position < text.size();) {
        if (isPlainAscii(text[position])) {
            ++position;
            continue;
        }
        const auto character = cim::decodeUtf8(text, position);
        if (!character || !isDisplayable(character->code)) {
            return false;
        }
        position += character->length;
    }
    return true;
}

std::string displayText(std::string_view raw) {
    if (isDisplayable(raw)) {
        return std::string(raw);
    }
    std::string text;
    for (std::size_t position = 0; position < raw.size();) {
        const auto character = cim::decodeUtf8(raw, position);
        if (!character) {
            text += fmt::format("\\x{:02X}", static_cast<unsigned char>(raw[position]));
            ++position;
            continue;
        }
        if (isDisplayable(character->code)) {
            text += raw.substr(position, character->length);
        } else {
            text += escapedCharacter(character->code);
        }
        position += character->length;
    }
    return text;
}

std::size_t displayWidth(std::string_view text) {
    if (std::all_of(text.begin(), text.end(), isPlainAscii)) {
        return text.size();
    }
    std::size_t width = 0;
    forEachCharacter(text, [&](char32_t code, std::string_view) { width += widthOf(code); });
    return width;
}

std::string clippedTo(std::string_view text, std::size_t width) {
    if (displayWidth(text) <= width) {
        return std::string(text);
    }
    if (width == 0) {
        return {};
    }
    std::string result;
    std::size_t used = 0;
    bool full = false;
    forEachCharacter(text, [&](char32_t code, std::string_view bytes) {
        full = full || used + widthOf(code) > width - 1;
        if (!full) {
            used += widthOf(code);
            result += bytes;
        }
    });
    return result.append(kEllipsis);
}

} // namespace qelo::cli
