// Values as plain text.
#include "Instance.h"
#include "ObjectPath.h"
#include "Utf8.h"
#include "Value.h"

#include <array>
#include <charconv>
#include <cmath>

namespace qelo::cim {
namespace {

// The shortest text that reads as the same number in the given type.
template <typename Real> std::string shortest(Real value) {
    std::array<char, 64> buffer{}; // a double takes at most 24 characters
    const auto result = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value);
    return std::string(buffer.data(), result.ptr);
}

std::string realText(Type type, double value) {
    if (std::isnan(value)) {
        return "NaN";
    }
    if (std::isinf(value)) {
        return value < 0 ? "-INF" : "INF";
    }
    return type == Type::Real32 ? shortest(static_cast<float>(value)) : shortest(value);
}

std::string instanceText(const Instance& instance) {
    std::string text = instance.className() + "{";
    const char* separator = "";
    for (const Instance::Property& property : instance.properties()) {
        text += separator + property.name + "=" + property.value.toText();
        separator = ",";
    }
    return text + "}";
}

struct TextOf {
    Type type;

    std::string operator()(std::monostate) const { return {}; }
    std::string operator()(bool value) const { return value ? "true" : "false"; }
    std::string operator()(std::uint64_t value) const {
        return type == Type::Char16 ? utf8(static_cast<char32_t>(value)) : std::to_string(value);
    }
    std::string operator()(std::int64_t value) const { return std::to_string(value); }
    std::string operator()(double value) const { return realText(type, value); }
    std::string operator()(const std::string& value) const { return value; }
    std::string operator()(const DateTime& value) const { return value.text(); }
    std::string operator()(const std::shared_ptr<const ObjectPath>& value) const {
        return value->toText();
    }
    std::string operator()(const std::shared_ptr<const Instance>& value) const {
        return instanceText(*value);
    }
    std::string operator()(const Value::Array& elements) const {
        std::string text;
        const char* separator = "";
        for (const Value& element : elements) {
            text += separator + element.toText();
            separator = ",";
        }
        return text;
    }
};

} // namespace

std::string Value::toText() const { return std::visit(TextOf{type_}, data_); }

} // namespace qelo::cim
