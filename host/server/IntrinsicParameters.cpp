#include "IntrinsicParameters.h"

#include <cim/ValueParser.h>

#include <algorithm>

namespace qelo::server {
namespace {

constexpr unsigned int kInvalidParameter = 4;

// No class of any schema has so many properties.
constexpr std::size_t kMostProperties = 256;

[[noreturn]] void refuse(const std::string& name, const std::string& problem) {
    throw client::CimError(kInvalidParameter, "parameter " + name + ": " + problem);
}

// Clients write blanks and line ends around a boolean.
std::string_view trimmed(std::string_view text) {
    constexpr std::string_view blanks = " \t\r\n";
    const std::size_t begin = std::min(text.find_first_not_of(blanks), text.size());
    text.remove_prefix(begin);
    return text.substr(0, text.find_last_not_of(blanks) + 1);
}

bool isGiven(const cimxml::IntrinsicParameter& parameter) {
    return !std::holds_alternative<std::monostate>(parameter.value);
}

} // namespace

IntrinsicParameters::IntrinsicParameters(const cimxml::Request& request,
                                         std::initializer_list<const char*> known)
    : request_(request) {
    const auto& all = request.intrinsicParameters;
    for (auto parameter = all.begin(); parameter != all.end(); ++parameter) {
        const auto isNamed = [&](const auto& name) { return cim::sameName(name, parameter->name); };
        if (std::none_of(known.begin(), known.end(), isNamed)) {
            refuse(parameter->name, request.method + " has none of that name");
        }
        if (std::any_of(all.begin(), parameter,
                        [&](const auto& other) { return isNamed(other.name); })) {
            refuse(parameter->name, "given twice");
        }
    }
}

const cimxml::IntrinsicParameter* IntrinsicParameters::find(const char* name) const {
    const auto& all = request_.intrinsicParameters;
    const auto found = std::find_if(all.begin(), all.end(), [&](const auto& parameter) {
        return cim::sameName(parameter.name, name);
    });
    return found == all.end() || !isGiven(*found) ? nullptr : &*found;
}

// Null when the parameter is absent or NULL.
template <class Kind>
const Kind* IntrinsicParameters::get(const char* name, const char* expected) const {
    const cimxml::IntrinsicParameter* const parameter = find(name);
    if (parameter == nullptr) {
        return nullptr;
    }
    const Kind* const value = std::get_if<Kind>(&parameter->value);
    if (value == nullptr) {
        refuse(name, std::string(expected) + " is expected");
    }
    return value;
}

template <class Kind>
const Kind& IntrinsicParameters::require(const char* name, const char* expected) const {
    const Kind* const value = get<Kind>(name, expected);
    if (value == nullptr) {
        refuse(name, "missing");
    }
    return *value;
}

bool IntrinsicParameters::flag(const char* name, bool byDefault) const {
    const std::string* const value = get<std::string>(name, "a boolean");
    if (value == nullptr) {
        return byDefault;
    }
    std::string problem;
    const auto parsed = cim::parseValue(cim::Type::Boolean, trimmed(*value), problem);
    if (!parsed) {
        refuse(name, problem);
    }
    return parsed->asBoolean();
}

std::string IntrinsicParameters::text(const char* name) const {
    const std::string* const value = get<std::string>(name, "a text");
    return value == nullptr ? std::string() : *value;
}

// Some clients send a class name as plain text.
std::string IntrinsicParameters::className(const char* name) const {
    const cimxml::IntrinsicParameter* const parameter = find(name);
    if (parameter != nullptr) {
        if (const auto* value = std::get_if<std::string>(&parameter->value)) {
            return *value;
        }
    }
    const auto* const value = get<cimxml::ClassName>(name, "the name of a class");
    return value == nullptr ? std::string() : value->name;
}

client::PropertyList IntrinsicParameters::propertyList() const {
    constexpr char name[] = "PropertyList";
    const auto* const list = get<cimxml::TextList>(name, "a list of names");
    if (list == nullptr) {
        return std::nullopt;
    }
    std::vector<std::string> names;
    for (const auto& item : *list) {
        if (!item) {
            refuse(name, "a name is NULL");
        }
        // Every instance is held against the list: a long one would keep a worker busy.
        if (names.size() == kMostProperties) {
            refuse(name, "more than " + std::to_string(kMostProperties) + " names");
        }
        names.push_back(*item);
    }
    return names;
}

cim::Value IntrinsicParameters::rawValue(const char* name) const {
    const cimxml::IntrinsicParameter* const parameter = find(name);
    if (parameter == nullptr) {
        return {};
    }
    if (const auto* list = std::get_if<cimxml::TextList>(&parameter->value)) {
        cim::Value::Array elements;
        for (const auto& item : *list) {
            elements.push_back(item ? cim::Value::string(*item) : cim::Value());
        }
        return cim::Value::array(cim::Type::String, std::move(elements));
    }
    if (const auto* path = std::get_if<cim::ObjectPath>(&parameter->value)) {
        return cim::Value::reference(*path);
    }
    return cim::Value::string(require<std::string>(name, "a value"));
}

std::string IntrinsicParameters::requiredText(const char* name) const {
    return require<std::string>(name, "a text");
}

std::string IntrinsicParameters::requiredClassName(const char* name) const {
    std::string text = className(name);
    if (text.empty()) {
        refuse(name, "missing");
    }
    return text;
}

cim::ObjectPath IntrinsicParameters::requiredInstanceName(const char* name) const {
    cim::ObjectPath path = require<cim::ObjectPath>(name, "the name of an instance");
    path.setNameSpace(request_.target.nameSpace());
    return path;
}

cim::Instance IntrinsicParameters::requiredInstance(const char* name) const {
    cim::Instance instance = require<cim::Instance>(name, "an instance");
    instance.mutablePath().setNameSpace(request_.target.nameSpace());
    return instance;
}

} // namespace qelo::server
