#include "MofValues.h"

#include <cim/ValueParser.h>

#include <stdexcept>

namespace qelo::schema {
namespace {

using cim::Type;
using cim::Value;

constexpr std::uint64_t kSignBit = std::uint64_t(1) << 63U;

bool isSigned(Type type) {
    return type == Type::SInt8 || type == Type::SInt16 || type == Type::SInt32 ||
           type == Type::SInt64;
}

bool isUnsigned(Type type) {
    return type == Type::UInt8 || type == Type::UInt16 || type == Type::UInt32 ||
           type == Type::UInt64 || type == Type::Char16;
}

std::optional<Value> signedValue(const Token& token, Type type) {
    if (token.magnitude > kSignBit || (token.magnitude == kSignBit && !token.negative)) {
        return std::nullopt;
    }
    // Two's complement without leaving the range on the way.
    const std::uint64_t bits = token.negative ? ~token.magnitude + 1 : token.magnitude;
    return Value::signedInteger(type, static_cast<std::int64_t>(bits));
}

std::optional<Value> integerValue(const Token& token, Type type) {
    try {
        if (isSigned(type)) {
            return signedValue(token, type);
        }
        if (isUnsigned(type) && (!token.negative || token.magnitude == 0)) {
            return Value::unsignedInteger(type, token.magnitude);
        }
    } catch (const std::invalid_argument&) {
        // Out of the type's range, as the caller says.
    }
    return std::nullopt;
}

std::optional<Value> parsed(Type type, const std::string& text) {
    std::string ignored;
    return cim::parseValue(type, text, ignored);
}

// MOF may leave out the digit in front of the point.
std::string decimalText(const Token& token) {
    if (token.kind == TokenKind::Integer) {
        return (token.negative ? "-" : "") + std::to_string(token.magnitude);
    }
    std::string text(token.text);
    if (text.front() == '+') {
        text.erase(0, 1);
    }
    const std::size_t point = text.find('.');
    if (point == 0 || text[point - 1] == '-') {
        text.insert(point, "0");
    }
    return text;
}

std::optional<Value> numberValue(const Token& token, Type type) {
    if (type == Type::Real32 || type == Type::Real64) {
        return parsed(type, decimalText(token));
    }
    return token.kind == TokenKind::Integer ? integerValue(token, type) : std::nullopt;
}

std::optional<Value> nameValue(const Token& token, Type type) {
    if (isKeyword(token, "NULL")) {
        return Value::null(type);
    }
    if (type != Type::Boolean) {
        return std::nullopt;
    }
    if (isKeyword(token, "TRUE") || isKeyword(token, "FALSE")) {
        return Value::boolean(isKeyword(token, "TRUE"));
    }
    return std::nullopt;
}

std::optional<Value> stringValue(const Token& token, Type type, const ReferenceSource& references,
                                 std::string& problem) {
    if (type == Type::String) {
        return Value::string(token.value);
    }
    if (type == Type::DateTime) {
        return parsed(type, token.value);
    }
    if (type == Type::Reference) {
        cim::ObjectPath path = references.reference(token.value, problem);
        return problem.empty() ? std::make_optional(Value::reference(std::move(path)))
                               : std::nullopt;
    }
    return std::nullopt;
}

std::optional<Value> aliasValue(const Token& token, Type type, const ReferenceSource& references,
                                std::string& problem) {
    if (type != Type::Reference) {
        return std::nullopt;
    }
    const cim::ObjectPath* path = references.alias(token.text);
    if (path == nullptr) {
        problem = "no such alias: $" + std::string(token.text);
        return std::nullopt;
    }
    return Value::reference(*path);
}

std::optional<Value> literalValue(const Token& token, Type type, const ReferenceSource& references,
                                  std::string& problem) {
    switch (token.kind) {
    case TokenKind::Name:
        return nameValue(token, type);
    case TokenKind::Integer:
    case TokenKind::Real:
        return numberValue(token, type);
    case TokenKind::String:
        return stringValue(token, type, references, problem);
    case TokenKind::Character:
        return type == Type::Char16 ? parsed(type, token.value) : std::nullopt;
    case TokenKind::Alias:
        return aliasValue(token, type, references, problem);
    default:
        return std::nullopt;
    }
}

std::optional<Value> scalar(const Token& token, Type type, const ReferenceSource& references,
                            std::string& problem) {
    auto value = literalValue(token, type, references, problem);
    if (!value && problem.empty()) {
        problem = std::string("not a value of type ") + cim::typeName(type);
    }
    return value;
}

} // namespace

bool isKeyword(const Token& token, std::string_view keyword) {
    return token.kind == TokenKind::Name && cim::sameName(token.text, keyword);
}

std::optional<Value> typedValue(const Initializer& initializer, Type type, bool array,
                                const ReferenceSource& references, std::string& problem) {
    const bool null = !initializer.array && isKeyword(initializer.literals.front(), "NULL");
    if (null) {
        return Value::null(type, array);
    }
    if (initializer.array != array) {
        problem = array ? "an array {...} is expected" : "a single value is expected";
        return std::nullopt;
    }
    if (!array) {
        return scalar(initializer.literals.front(), type, references, problem);
    }
    Value::Array elements;
    elements.reserve(initializer.literals.size());
    for (const Token& literal : initializer.literals) {
        auto element = scalar(literal, type, references, problem);
        if (!element) {
            return std::nullopt;
        }
        elements.push_back(std::move(*element));
    }
    return Value::array(type, std::move(elements));
}

std::optional<Type> inferredType(const Initializer& initializer) {
    if (initializer.literals.empty()) {
        return std::nullopt;
    }
    const Token& first = initializer.literals.front();
    switch (first.kind) {
    case TokenKind::String:
        return Type::String;
    case TokenKind::Character:
        return Type::Char16;
    case TokenKind::Real:
        return Type::Real64;
    case TokenKind::Name:
        return isKeyword(first, "NULL") ? std::nullopt : std::make_optional(Type::Boolean);
    default:
        return std::nullopt; // an integer may be of any width
    }
}

} // namespace qelo::schema
