#include "Value.h"

#include "Instance.h"
#include "ObjectPath.h"

#include <cmath>
#include <limits>
#include <stdexcept>

namespace qelo::cim {
namespace {

[[noreturn]] void refuse(Type type, const char* reason) {
    throw std::invalid_argument(std::string(typeName(type)) + ": " + reason);
}

// The largest value of an unsigned type.
std::uint64_t unsignedLimit(Type type) {
    switch (type) {
    case Type::UInt8:
        return std::numeric_limits<std::uint8_t>::max();
    case Type::Char16:
    case Type::UInt16:
        return std::numeric_limits<std::uint16_t>::max();
    case Type::UInt32:
        return std::numeric_limits<std::uint32_t>::max();
    case Type::UInt64:
        return std::numeric_limits<std::uint64_t>::max();
    default:
        refuse(type, "not an unsigned type");
    }
}

// The largest value of a signed type; the smallest is its negative less one.
std::int64_t signedLimit(Type type) {
    switch (type) {
    case Type::SInt8:
        return std::numeric_limits<std::int8_t>::max();
    case Type::SInt16:
        return std::numeric_limits<std::int16_t>::max();
    case Type::SInt32:
        return std::numeric_limits<std::int32_t>::max();
    case Type::SInt64:
        return std::numeric_limits<std::int64_t>::max();
    default:
        refuse(type, "not a signed type");
    }
}

// The first number that no longer rounds to the largest real32, whose own text, being the
// shortest one, may denote a number slightly above it.
constexpr double kBeyondReal32 = 0x1.ffffffp127;

double roundedTo32(double value) {
    if (std::isfinite(value) && std::fabs(value) >= kBeyondReal32) {
        refuse(Type::Real32, "value out of range");
    }
    return static_cast<double>(static_cast<float>(value));
}

// Contents of the same alternative; what is shared by pointer is compared by what it points at.
struct SameContents {
    template <typename T> bool operator()(const T& left, const T& right) const {
        return left == right;
    }
    template <typename T>
    bool operator()(const std::shared_ptr<const T>& left,
                    const std::shared_ptr<const T>& right) const {
        return left == right || *left == *right;
    }
    template <typename T, typename U> bool operator()(const T&, const U&) const { return false; }
};

} // namespace

const char* typeName(Type type) {
    switch (type) {
    case Type::Boolean:
        return "boolean";
    case Type::Char16:
        return "char16";
    case Type::UInt8:
        return "uint8";
    case Type::UInt16:
        return "uint16";
    case Type::UInt32:
        return "uint32";
    case Type::UInt64:
        return "uint64";
    case Type::SInt8:
        return "sint8";
    case Type::SInt16:
        return "sint16";
    case Type::SInt32:
        return "sint32";
    case Type::SInt64:
        return "sint64";
    case Type::Real32:
        return "real32";
    case Type::Real64:
        return "real64";
    case Type::String:
        return "string";
    case Type::DateTime:
        return "datetime";
    case Type::Reference:
        return "reference";
    case Type::Instance:
        return "instance";
    }
    return "unknown";
}

Value Value::null(Type type, bool array) { return Value(type, array, std::monostate{}); }

Value Value::boolean(bool value) { return Value(Type::Boolean, false, value); }

Value Value::unsignedInteger(Type type, std::uint64_t value) {
    if (value > unsignedLimit(type)) {
        refuse(type, "value out of range");
    }
    return Value(type, false, value);
}

Value Value::signedInteger(Type type, std::int64_t value) {
    const std::int64_t limit = signedLimit(type);
    if (value > limit || value < -limit - 1) {
        refuse(type, "value out of range");
    }
    return Value(type, false, value);
}

Value Value::real(Type type, double value) {
    if (type != Type::Real32 && type != Type::Real64) {
        refuse(type, "not a real type");
    }
    return Value(type, false, type == Type::Real32 ? roundedTo32(value) : value);
}

Value Value::string(std::string text) { return Value(Type::String, false, std::move(text)); }

void Value::setString(std::string_view text) {
    if (auto* const held = std::get_if<std::string>(&data_)) {
        held->assign(text);
    } else {
        data_ = std::string(text);
    }
    type_ = Type::String;
    array_ = false;
}

Value Value::dateTime(cim::DateTime value) {
    return Value(Type::DateTime, false, std::move(value));
}

Value Value::reference(ObjectPath path) {
    return Value(Type::Reference, false, std::make_shared<const ObjectPath>(std::move(path)));
}

Value Value::instance(cim::Instance value) {
    return Value(Type::Instance, false, std::make_shared<const cim::Instance>(std::move(value)));
}

Value Value::array(Type type, Array elements) {
    for (const Value& element : elements) {
        if (element.type() != type || element.isArray()) {
            refuse(type, "an array element of another type");
        }
    }
    return Value(type, true, std::move(elements));
}

bool operator==(const Value& left, const Value& right) {
    return left.type() == right.type() && left.isArray() == right.isArray() &&
           std::visit(SameContents{}, left.data(), right.data());
}

} // namespace qelo::cim
