#include "Password.h"

#include "host/server/RawClient.h"

#include <cim/Utf8.h>

#include <cctype>
#include <random>

namespace qelo::secrets {
namespace {

std::string random(std::size_t length) {
    constexpr std::string_view characters =
        "ABCDEFGHJKLMNPQRSTUVWXYZabcdefghijkmnopqrstuvwxyz0123456789";
    std::random_device device;
    std::uniform_int_distribution<std::size_t> any(0, characters.size() - 1);
    std::string text;
    while (text.size() < length) {
        text += characters[any(device)];
    }
    return text;
}

// In units of so many bytes; no character here needs two of them.
std::string wide(const std::string& text, std::size_t width, bool bigEndian) {
    std::string result;
    for (std::size_t position = 0; position < text.size();) {
        const auto character = cim::decodeUtf8(text, position).value();
        position += character.length;
        std::string unit(width, '\0');
        unit[bigEndian ? width - 1 : 0] = static_cast<char>(character.code & 0xFFU);
        unit[bigEndian ? width - 2 : 1] = static_cast<char>(character.code >> 8U);
        result += unit;
    }
    return result;
}

// As JSON and C have it within quotes.
std::string escaped(const std::string& text) {
    std::string result;
    for (const char c : text) {
        result += c == '"' || c == '\\' ? std::string("\\") + c : std::string(1, c);
    }
    return result;
}

// What base64 makes of the text, whatever stands before and behind it: the digits that depend on
// nothing else.
std::string base64Behind(std::size_t before, const std::string& text) {
    const std::string digits = server::base64(std::string(before, '.') + text);
    const std::size_t first = before == 0 ? 0 : before + 1;
    const std::size_t whole = (before + text.size()) / 3 * 4;
    return digits.substr(first, whole - first);
}

} // namespace

Password Password::plain() { return Password("Pw" + random(22)); }

Password Password::awkward() { return Password(random(12) + "&<é \">%+'/=" + random(12)); }

Password::Password(std::string text) : text_(std::move(text)) {
    forms_ = {{"plain", text_},
              {"UTF-16LE", wide(text_, 2, false)},
              {"UTF-16BE", wide(text_, 2, true)},
              {"UTF-32LE", wide(text_, 4, false)},
              {"UTF-32BE", wide(text_, 4, true)}};
    if (escaped(text_) != text_) {
        forms_.emplace_back("escaped", escaped(text_));
    }
    for (const std::size_t before : {0U, 1U, 2U}) {
        forms_.emplace_back("base64, " + std::to_string(before) + " before",
                            base64Behind(before, text_));
    }
    if (inUrl() != text_) {
        forms_.emplace_back("percent-encoded", inUrl());
    }
    if (inXml() != text_) {
        forms_.emplace_back("XML-escaped", inXml());
    }
}

std::string Password::inUrl() const {
    constexpr char digits[] = "0123456789ABCDEF";
    std::string result;
    for (const char c : text_) {
        const auto byte = static_cast<unsigned char>(c);
        if (std::isalnum(byte) != 0) {
            result += c;
        } else {
            result += {'%', digits[byte >> 4U], digits[byte & 15U]};
        }
    }
    return result;
}

std::string Password::inXml() const {
    std::string result;
    for (const char c : text_) {
        result += c == '&' ? "&amp;" : c == '<' ? "&lt;" : c == '>' ? "&gt;" : std::string(1, c);
    }
    return result;
}

std::string Password::formsIn(std::string_view text) const {
    std::string names;
    for (const auto& [name, form] : forms_) {
        if (text.find(form) != std::string_view::npos) {
            names += (names.empty() ? "" : ", ") + name;
        }
    }
    return names;
}

} // namespace qelo::secrets
