#include "Mof.h"

#include "Display.h"

#include <cim/QuotedText.h>
#include <cim/Utf8.h>

#include <fmt/format.h>

#include <algorithm>
#include <cmath>

namespace qelo::cli {
namespace {

using cim::Type;
using cim::Value;

// What quoting leaves: valid characters that are nothing for a terminal, and stray bytes.
std::string escapedBeyondAscii(std::string_view text) {
    std::string result;
    for (std::size_t position = 0; position < text.size();) {
        const auto character = cim::decodeUtf8(text, position);
        const std::size_t length = character ? character->length : 1;
        const char32_t code = character ? character->code : U'\xFFFD';
        // \x reaches no further than U+FFFF; what lies beyond is harmless.
        if (!character || (code <= 0xFFFF && !isDisplayable(code))) {
            result += fmt::format("\\x{:04X}", static_cast<unsigned int>(code));
        } else {
            result += text.substr(position, length);
        }
        position += length;
    }
    return result;
}

std::string mofCharacter(const Value& value) {
    const std::string text = value.toText();
    if (text == "'") {
        return "'\\''";
    }
    std::string literal = mofString(text);
    literal.front() = '\'';
    literal.back() = '\'';
    return literal;
}

// A real literal needs its decimal point.
std::string mofReal(const Value& value) {
    if (!std::isfinite(value.asReal())) {
        return "NULL";
    }
    std::string text = value.toText();
    const std::size_t mantissa = std::min(text.find('e'), text.size());
    if (text.find('.') == std::string::npos) {
        text.insert(mantissa, ".0");
    }
    return text;
}

std::string mofArray(const Value::Array& elements) {
    std::string text = "{";
    const char* separator = "";
    for (const Value& element : elements) {
        text += separator + mofValue(element);
        separator = ", ";
    }
    return text + "}";
}

} // namespace

std::string mofString(std::string_view text) {
    std::string literal = cim::quotedText(text);
    return isDisplayable(std::string_view(literal)) ? literal : escapedBeyondAscii(literal);
}

std::string mofValue(const Value& value) {
    if (value.isNull()) {
        return "NULL";
    }
    if (value.isArray()) {
        return mofArray(value.asArray());
    }
    switch (value.type()) {
    case Type::Boolean:
        return value.asBoolean() ? "TRUE" : "FALSE";
    case Type::Char16:
        return mofCharacter(value);
    case Type::Real32:
    case Type::Real64:
        return mofReal(value);
    case Type::Instance:
        return mofString(mofInstance(value.asInstance()));
    case Type::String:
    case Type::DateTime:
    case Type::Reference:
        return mofString(value.toText());
    default:
        return value.toText();
    }
}

std::string mofInstance(const cim::Instance& instance) {
    std::string text = "instance of " + displayText(instance.className()) + " {\n";
    for (const auto& property : instance.properties()) {
        text += "    " + displayText(property.name) + " = " + mofValue(property.value) + ";\n";
    }
    return text + "};\n";
}

} // namespace qelo::cli
