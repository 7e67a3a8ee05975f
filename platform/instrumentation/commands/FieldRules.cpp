#include "FieldRules.h"

#include <algorithm>
#include <charconv>
#include <limits>

namespace qelo::store {

namespace {

constexpr std::size_t kLongestText = 255;
constexpr std::size_t kLongestName = 31;

bool isLower(char c) { return (c >= 'a' && c <= 'z') || c == '_'; }

bool isDigit(char c) { return c >= '0' && c <= '9'; }

// How many bytes the character led by `lead` has, and its lowest proper code point (a lower
// one would be an overlong form). No length for a byte that leads no character.
struct Shape {
    std::size_t length;
    std::uint32_t bits;
    std::uint32_t lowest;
};

Shape shapeOf(unsigned char lead) {
    if (lead < 0x80) {
        return {1, lead, 0};
    }
    if ((lead & 0xe0u) == 0xc0) {
        return {2, lead & 0x1fu, 0x80};
    }
    if ((lead & 0xf0u) == 0xe0) {
        return {3, lead & 0x0fu, 0x800};
    }
    if ((lead & 0xf8u) == 0xf0) {
        return {4, lead & 0x07u, 0x10000};
    }
    return {0, 0, 0};
}

// Control characters of both kinds are refused too: the second kind (U+0080 to U+009F)
// starts terminal sequences.
bool isAllowedCodePoint(std::uint32_t point) {
    const bool control = point < 0x20 || (point >= 0x7f && point <= 0x9f);
    const bool surrogate = point >= 0xd800 && point <= 0xdfff;
    return !control && !surrogate && point <= 0x10ffff;
}

// Removes one character from the front of `text`; false when it is no allowed one.
bool takeCharacter(std::string_view& text) {
    const Shape shape = shapeOf(static_cast<unsigned char>(text.front()));
    if (shape.length == 0 || text.size() < shape.length) {
        return false;
    }
    std::uint32_t point = shape.bits;
    for (std::size_t i = 1; i < shape.length; ++i) {
        const auto next = static_cast<unsigned char>(text[i]);
        if ((next & 0xc0u) != 0x80) {
            return false;
        }
        point = (point << 6u) | (next & 0x3fu);
    }
    text.remove_prefix(shape.length);
    return point >= shape.lowest && isAllowedCodePoint(point);
}

bool isCleanText(std::string_view text) {
    while (!text.empty()) {
        if (!takeCharacter(text)) {
            return false;
        }
    }
    return true;
}

Problem checkText(std::string_view text) {
    if (text.size() > kLongestText) {
        return "is longer than 255 bytes";
    }
    if (!isCleanText(text)) {
        return "holds control characters or is not UTF-8";
    }
    return {};
}

bool isProperPart(std::string_view part) { return !part.empty() && part != "." && part != ".."; }

} // namespace

Problem checkNewName(std::string_view name) {
    const auto allowed = [](char c) { return isLower(c) || isDigit(c) || c == '-'; };
    if (name.empty() || name.size() > kLongestName || !isLower(name.front()) ||
        !std::all_of(name.begin(), name.end(), allowed)) {
        return "is not a name for a new account or group";
    }
    return {};
}

Problem checkExistingName(std::string_view name) {
    const auto splits = [](char c) {
        return static_cast<unsigned char>(c) < 0x20 || c == 0x7f || c == ':' || c == ',';
    };
    if (name.empty() || name.size() > kLongestText ||
        std::any_of(name.begin(), name.end(), splits)) {
        return "cannot be the name of an account or group";
    }
    return {};
}

Problem checkFullName(std::string_view text) {
    if (text.find_first_of(":,") != std::string_view::npos) {
        return "holds \":\" or \",\"";
    }
    return checkText(text);
}

Problem checkPath(std::string_view path) {
    if (Problem problem = checkText(path)) {
        return problem;
    }
    if (path.find_first_of(":,") != std::string_view::npos) {
        return "holds \":\" or \",\"";
    }
    if (path.size() < 2 || path.front() != '/') {
        return "is not an absolute path";
    }
    for (std::size_t start = 1; start <= path.size();) {
        const std::size_t end = std::min(path.find('/', start), path.size());
        if (!isProperPart(path.substr(start, end - start))) {
            return "has an empty part, \".\" or \"..\" in its path";
        }
        start = end + 1;
    }
    return {};
}

Problem checkPassword(std::string_view password) {
    if (password.empty()) {
        return "is empty";
    }
    return checkText(password);
}

Attempt<std::uint32_t> parseNumber(std::string_view text) {
    const bool digits = !text.empty() && std::all_of(text.begin(), text.end(), isDigit);
    const bool shortest = text.size() == 1 || (!text.empty() && text.front() != '0');
    std::int32_t number = 0;
    const auto end = text.data() + text.size();
    const auto read = std::from_chars(text.data(), end, number);
    if (!digits || !shortest || read.ec != std::errc() || read.ptr != end) {
        return Refusal{"is not a number from 0 to 2147483647"};
    }
    return static_cast<std::uint32_t>(number);
}

std::string printable(std::string_view text) {
    std::string shown(text.substr(0, kLongestText));
    std::replace_if(
        shown.begin(), shown.end(), [](char c) { return c < 0x20 || c > 0x7e; }, '?');
    return shown;
}

} // namespace qelo::store
