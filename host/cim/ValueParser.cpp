#include "ValueParser.h"

#include "ObjectPath.h"
#include "Utf8.h"

#include <array>
#include <charconv>
#include <cmath>
#include <limits>
#include <stdexcept>

namespace qelo::cim {
namespace {

constexpr std::array<Type, 14> kTextTypes = {
    Type::Boolean, Type::Char16, Type::UInt8,  Type::UInt16,  Type::UInt32,
    Type::UInt64,  Type::SInt8,  Type::SInt16, Type::SInt32,  Type::SInt64,
    Type::Real32,  Type::Real64, Type::String, Type::DateTime};

bool isSigned(Type type) { return type >= Type::SInt8 && type <= Type::SInt64; }

// An integer as sign and magnitude, before its type limits it.
struct Integer {
    bool negative = false;
    std::uint64_t magnitude = 0;
};

// `inRange` is false when the text is an integer that even 64 bits cannot hold.
std::optional<Integer> readInteger(std::string_view text, bool& inRange) {
    Integer result;
    if (!text.empty() && (text[0] == '-' || text[0] == '+')) {
        result.negative = text[0] == '-';
        text.remove_prefix(1);
    }
    int base = 10;
    if (text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X')) {
        base = 16;
        text.remove_prefix(2);
    }
    const char* const end = text.data() + text.size();
    const auto [stop, code] = std::from_chars(text.data(), end, result.magnitude, base);
    inRange = code != std::errc::result_out_of_range;
    if (code == std::errc::invalid_argument || stop != end) {
        return std::nullopt;
    }
    return result;
}

// Two's complement of the magnitude; the caller has tested that it fits.
std::optional<std::int64_t> toSigned(const Integer& integer) {
    constexpr std::uint64_t limit = std::numeric_limits<std::int64_t>::max();
    if (integer.magnitude > limit + (integer.negative ? 1 : 0)) {
        return std::nullopt;
    }
    if (!integer.negative) {
        return static_cast<std::int64_t>(integer.magnitude);
    }
    return integer.magnitude == 0 ? 0 : -static_cast<std::int64_t>(integer.magnitude - 1) - 1;
}

std::optional<Value> integerValue(Type type, const Integer& integer) {
    try {
        if (!isSigned(type)) {
            const bool representable = !integer.negative || integer.magnitude == 0;
            return representable ? std::optional(Value::unsignedInteger(type, integer.magnitude))
                                 : std::nullopt;
        }
        const auto value = toSigned(integer);
        return value ? std::optional(Value::signedInteger(type, *value)) : std::nullopt;
    } catch (const std::invalid_argument&) {
        return std::nullopt;
    }
}

std::optional<Value> parseInteger(Type type, std::string_view text, std::string& error) {
    bool inRange = true;
    const auto integer = readInteger(text, inRange);
    if (!integer) {
        error = "an integer is expected";
        return std::nullopt;
    }
    auto value = inRange ? integerValue(type, *integer) : std::nullopt;
    if (!value) {
        error = std::string("the number is out of the range of ") + typeName(type);
    }
    return value;
}

std::optional<Value> parseBoolean(std::string_view text, std::string& error) {
    if (sameName(text, "true") || sameName(text, "false")) {
        return Value::boolean(sameName(text, "true"));
    }
    error = "true or false is expected";
    return std::nullopt;
}

std::optional<double> specialReal(std::string_view text) {
    if (text == "INF" || text == "-INF") {
        const double infinity = std::numeric_limits<double>::infinity();
        return text[0] == '-' ? -infinity : infinity;
    }
    return text == "NaN" ? std::optional(std::numeric_limits<double>::quiet_NaN()) : std::nullopt;
}

std::optional<Value> parseReal(Type type, std::string_view text, std::string& error) {
    if (const auto special = specialReal(text)) {
        return Value::real(type, *special);
    }
    const bool plus = text.size() > 1 && text[0] == '+' && text[1] != '-';
    const char* const begin = text.data() + (plus ? 1 : 0);
    const char* const end = text.data() + text.size();
    double number = 0;
    const auto [stop, code] = std::from_chars(begin, end, number);
    // from_chars itself knows "inf" and "nan" in several spellings; those are no numbers here.
    const bool isNumber =
        stop == end && code != std::errc::invalid_argument && std::isfinite(number);
    if (!isNumber) {
        error = "a number is expected";
        return std::nullopt;
    }
    if (code != std::errc::result_out_of_range) {
        try {
            return Value::real(type, number);
        } catch (const std::invalid_argument&) { // too large for a real32
        }
    }
    error = std::string("the number is out of the range of ") + typeName(type);
    return std::nullopt;
}

std::optional<Value> parseCharacter(std::string_view text, std::string& error) {
    const auto character = text.empty() ? std::nullopt : decodeUtf8(text, 0);
    if (!character || character->length != text.size() || character->code > 0xFFFF) {
        error = "exactly one character up to U+FFFF is expected";
        return std::nullopt;
    }
    return Value::unsignedInteger(Type::Char16, character->code);
}

std::optional<Value> parseDateTime(std::string_view text, std::string& error) {
    if (auto value = DateTime::parse(text)) {
        return Value::dateTime(*std::move(value));
    }
    error = "a datetime is expected: yyyymmddhhmmss.mmmmmm+ooo or ddddddddhhmmss.mmmmmm:000";
    return std::nullopt;
}

} // namespace

std::optional<Type> typeOfName(std::string_view name) {
    for (const Type type : kTextTypes) {
        if (sameName(name, typeName(type))) {
            return type;
        }
    }
    return std::nullopt;
}

std::optional<Value> parseValue(Type type, std::string_view text, std::string& error) {
    switch (type) {
    case Type::Boolean:
        return parseBoolean(text, error);
    case Type::Char16:
        return parseCharacter(text, error);
    case Type::Real32:
    case Type::Real64:
        return parseReal(type, text, error);
    case Type::String:
        return Value::string(std::string(text));
    case Type::DateTime:
        return parseDateTime(text, error);
    case Type::Reference:
    case Type::Instance:
        error = std::string("a value of type ") + typeName(type) + " cannot be given as one text";
        return std::nullopt;
    default:
        return parseInteger(type, text, error);
    }
}

} // namespace qelo::cim
