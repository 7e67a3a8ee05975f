#include "Text.h"

#include "common/Utf8.h"

#include <algorithm>

namespace qelo::nodes {

namespace {

using qelo::platform::kInvalidCodePoint;
using qelo::platform::nextCodePoint;

constexpr std::string_view replacement = "\xEF\xBF\xBD"; // U+FFFD

bool isAscii(std::string_view text) {
    return std::all_of(text.begin(), text.end(),
                       [](char c) { return static_cast<unsigned char>(c) < 0x80; });
}

bool breaksLine(char32_t c) { return qelo::platform::isControl(c) || c == 0x2028 || c == 0x2029; }

void appendEscaped(std::string& out, std::string_view bytes) {
    constexpr std::string_view digits = "0123456789ABCDEF";
    for (const char c : bytes) {
        const auto byte = static_cast<unsigned char>(c);
        out += '%';
        out += digits[byte >> 4U];
        out += digits[byte & 0xFU];
    }
}

// Calls visit(character, its bytes) along the text.
template <class Visit> void eachCharacter(std::string_view text, Visit visit) {
    for (std::size_t at = 0; at < text.size();) {
        const std::size_t begin = at;
        const char32_t c = nextCodePoint(text, at);
        visit(c, text.substr(begin, at - begin));
    }
}

} // namespace

bool isValidUtf8(std::string_view text) {
    if (isAscii(text)) {
        return true;
    }
    bool valid = true;
    eachCharacter(text,
                  [&](char32_t c, std::string_view) { valid = valid && c != kInvalidCodePoint; });
    return valid;
}

std::string validUtf8(std::string_view text) {
    if (isAscii(text)) {
        return std::string(text);
    }
    std::string out;
    eachCharacter(text, [&](char32_t c, std::string_view bytes) {
        out += c == kInvalidCodePoint ? replacement : bytes;
    });
    return out;
}

std::string printable(std::string_view text) {
    std::string out;
    eachCharacter(text, [&](char32_t c, std::string_view bytes) {
        if (c == kInvalidCodePoint) {
            out += replacement;
        } else if (breaksLine(c)) {
            appendEscaped(out, bytes);
        } else {
            out += bytes;
        }
    });
    return out;
}

std::string pathStep(std::string_view name) {
    constexpr std::string_view plain = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz"
                                       "0123456789-._~";
    std::string out;
    for (std::size_t at = 0; at < name.size(); ++at) {
        if (plain.find(name[at]) != std::string_view::npos) {
            out += name[at];
        } else {
            appendEscaped(out, name.substr(at, 1));
        }
    }
    return out;
}

bool liesUnder(std::string_view path, std::string_view ancestor) {
    return path.size() > ancestor.size() + 1 && path.substr(0, ancestor.size()) == ancestor &&
           path[ancestor.size()] == '/';
}

} // namespace qelo::nodes
