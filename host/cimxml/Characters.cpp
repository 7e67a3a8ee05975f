#include "Characters.h"

#include "Pieces.h"

#include <cim/Utf8.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstddef>
#include <cstdint>

namespace qelo::cimxml {
namespace {

// What has to be done about a byte.
enum class Care : std::uint8_t {
    None,
    InAttribute, // only between quotes
    Always,
};

constexpr std::string_view kReplacement = "\xEF\xBF\xBD";

constexpr std::array<Care, 256> careTable() {
    std::array<Care, 256> table{};
    for (std::size_t byte = 0; byte < table.size(); ++byte) {
        table[byte] = byte < 0x20 || byte >= 0x80 ? Care::Always : Care::None;
    }
    table['\t'] = Care::InAttribute;
    table['\n'] = Care::InAttribute;
    table['"'] = Care::InAttribute;
    table['&'] = Care::Always;
    table['<'] = Care::Always;
    table['>'] = Care::Always;
    return table;
}

constexpr std::array<Care, 256> kCare = careTable();

std::string_view escaped(char c) {
    switch (c) {
    case '&':
        return "&amp;";
    case '<':
        return "&lt;";
    case '>':
        return "&gt;";
    case '"':
        return "&quot;";
    case '\t':
        return "&#9;";
    case '\n':
        return "&#10;";
    case '\r':
        return "&#13;";
    default:
        return kReplacement;
    }
}

bool isXmlCharacter(char32_t code) { return code != 0xFFFE && code != 0xFFFF; }

// Appends the character at `position`, which needs care, and returns how many bytes it took.
std::size_t appendSpecial(std::string& out, std::string_view text, std::size_t position) {
    if (static_cast<unsigned char>(text[position]) < 0x80) {
        out += escaped(text[position]);
        return 1;
    }
    const auto character = cim::decodeUtf8(text, position);
    if (!character) {
        out += kReplacement;
        return 1;
    }
    out +=
        isXmlCharacter(character->code) ? text.substr(position, character->length) : kReplacement;
    return character->length;
}

template <Care threshold> void appendEscaped(std::string& out, std::string_view text) {
    std::size_t plain = 0; // where the bytes begin that can be copied as they are
    std::size_t position = 0;
    while (position < text.size()) {
        if (kCare[static_cast<unsigned char>(text[position])] < threshold) {
            ++position;
            continue;
        }
        out.append(text.data() + plain, position - plain);
        position += appendSpecial(out, text, position);
        plain = position;
    }
    out.append(text.data() + plain, position - plain);
}

template <Care threshold> bool isPlain(std::string_view text) {
    return std::none_of(text.begin(), text.end(),
                        [](char c) { return kCare[static_cast<unsigned char>(c)] >= threshold; });
}

// The digits of a number, as long as this lives.
class Digits {
public:
    template <class Integer> explicit Digits(Integer number) {
        end_ = std::to_chars(digits_.data(), digits_.data() + digits_.size(), number).ptr;
    }
    std::string_view text() const {
        return {digits_.data(), static_cast<std::size_t>(end_ - digits_.data())};
    }

private:
    std::array<char, 24> digits_{}; // 64 bits take at most 20 characters
    const char* end_ = nullptr;
};

} // namespace

void appendText(std::string& out, std::string_view text) { appendEscaped<Care::Always>(out, text); }

void appendAttributeText(std::string& out, std::string_view text) {
    appendEscaped<Care::InAttribute>(out, text);
}

void appendAttribute(std::string& out, std::string_view name, std::string_view text) {
    out += ' ';
    out += name;
    out += "=\"";
    appendAttributeText(out, text);
    out += '"';
}

void Pieces::addText(std::string_view text) {
    if (isPlain<Care::Always>(text)) {
        add(text);
    } else {
        appendText(flush(), text);
    }
}

void Pieces::addAttributeText(std::string_view text) {
    if (isPlain<Care::InAttribute>(text)) {
        add(text);
    } else {
        appendAttributeText(flush(), text);
    }
}

void Pieces::addAttribute(std::string_view name, std::string_view text) {
    add(" ");
    add(name);
    add("=\"");
    addAttributeText(text);
    add("\"");
}

void Pieces::addNumber(std::uint64_t number) { add(Digits(number).text()); }
void Pieces::addNumber(std::int64_t number) { add(Digits(number).text()); }

} // namespace qelo::cimxml
