#include "QuotedText.h"

#include "Utf8.h"

#include <array>
#include <utility>

namespace qelo::cim {
namespace {

constexpr std::array<std::pair<char, char>, 5> kNamedControls = {
    {{'\b', 'b'}, {'\t', 't'}, {'\n', 'n'}, {'\f', 'f'}, {'\r', 'r'}}};

constexpr char kHexDigits[] = "0123456789ABCDEF";

bool isControl(char c) { return static_cast<unsigned char>(c) < 0x20 || c == '\x7f'; }

void appendControl(std::string& target, char c) {
    for (const auto& [control, letter] : kNamedControls) {
        if (c == control) {
            target += {'\\', letter};
            return;
        }
    }
    const auto byte = static_cast<unsigned char>(c);
    target += "\\x00";
    target += kHexDigits[byte >> 4];
    target += kHexDigits[byte & 0x0F];
}

int hexValue(char c) {
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    if (c >= 'a' && c <= 'f') {
        return c - 'a' + 10;
    }
    if (c >= 'A' && c <= 'F') {
        return c - 'A' + 10;
    }
    return -1;
}

// `position` stands behind "\x". False, with `error` set, when no usable character is named.
bool readHexEscape(std::string_view text, std::size_t& position, std::string& target,
                   std::string& error) {
    const std::size_t start = position;
    char32_t code = 0;
    while (position < text.size() && position - start < 4 && hexValue(text[position]) >= 0) {
        code = code * 16 + static_cast<char32_t>(hexValue(text[position]));
        ++position;
    }
    if (code == 0 || (code >= 0xD800 && code <= 0xDFFF)) {
        position = start;
        error = "\\x must be followed by the hexadecimal number of a character";
        return false;
    }
    appendUtf8(target, code);
    return true;
}

// `position` stands behind the backslash.
bool readEscape(std::string_view text, std::size_t& position, std::string& target,
                std::string& error) {
    const char letter = position < text.size() ? text[position] : '\0';
    if (letter == '"' || letter == '\\' || letter == '\'') {
        target += letter;
        ++position;
        return true;
    }
    if (letter == 'x' || letter == 'X') {
        ++position;
        return readHexEscape(text, position, target, error);
    }
    for (const auto& [control, name] : kNamedControls) {
        if (letter == name) {
            target += control;
            ++position;
            return true;
        }
    }
    error = "a backslash must be followed by one of \" \\ ' b t n f r x";
    return false;
}

} // namespace

void appendQuoted(std::string& target, std::string_view text) {
    target += '"';
    for (const char c : text) {
        if (isControl(c)) {
            appendControl(target, c);
            continue;
        }
        if (c == '"' || c == '\\') {
            target += '\\';
        }
        target += c;
    }
    target += '"';
}

std::string quotedText(std::string_view text) {
    std::string result;
    appendQuoted(result, text);
    return result;
}

std::optional<std::string> readQuoted(std::string_view text, std::size_t& position,
                                      std::string& error) {
    std::string result;
    ++position;
    while (position < text.size()) {
        const char c = text[position];
        if (c == '\0') {
            error = "a text must not contain a zero byte";
            return std::nullopt;
        }
        ++position;
        if (c == '"') {
            return result;
        }
        if (c != '\\') {
            result += c;
        } else if (!readEscape(text, position, result, error)) {
            return std::nullopt;
        }
    }
    error = "the closing quote is missing";
    return std::nullopt;
}

} // namespace qelo::cim
