#include "support/broker/Recorded.h"

#include <array>
#include <charconv>
#include <ostream>
#include <strings.h>

namespace qelo::test {

namespace {

struct TypeName {
    CMPIType type;
    const char* name;
};

constexpr std::array<TypeName, 23> typeNames = {{
    {CMPI_null, "null"},     {CMPI_boolean, "boolean"},   {CMPI_char16, "char16"},
    {CMPI_real32, "real32"}, {CMPI_real64, "real64"},     {CMPI_uint8, "uint8"},
    {CMPI_uint16, "uint16"}, {CMPI_uint32, "uint32"},     {CMPI_uint64, "uint64"},
    {CMPI_sint8, "sint8"},   {CMPI_sint16, "sint16"},     {CMPI_sint32, "sint32"},
    {CMPI_sint64, "sint64"}, {CMPI_instance, "instance"}, {CMPI_ref, "ref"},
    {CMPI_args, "args"},     {CMPI_filter, "filter"},     {CMPI_enumeration, "enumeration"},
    {CMPI_string, "string"}, {CMPI_chars, "chars"},       {CMPI_dateTime, "dateTime"},
    {CMPI_ptr, "ptr"},       {CMPI_charsptr, "charsptr"},
}};

bool sameName(const std::string& a, const std::string& b) {
    return strcasecmp(a.c_str(), b.c_str()) == 0;
}

const Value* findByName(const std::vector<NamedValue>& values, const std::string& name) {
    for (const NamedValue& entry : values) {
        if (sameName(entry.name, name)) {
            return &entry.value;
        }
    }
    return nullptr;
}

std::string textOf(const Value* value) {
    if (value == nullptr) {
        return "<none>";
    }
    return value->isNull ? "<null>" : value->text;
}

std::vector<std::string> namesOf(const std::vector<NamedValue>& values) {
    std::vector<std::string> names;
    for (const NamedValue& entry : values) {
        names.push_back(entry.name);
    }
    return names;
}

template <typename Number> std::string numberText(Number number) {
    std::array<char, 64> buffer{};
    const auto result = std::to_chars(buffer.data(), buffer.data() + buffer.size(), number);
    return std::string(buffer.data(), result.ptr);
}

template <typename Number>
Value numberValue(CMPIType type, Number CMPIValue::*member, Number number) {
    Value value;
    value.type = type;
    value.isNull = false;
    value.scalar.*member = number;
    value.text = numberText(number);
    return value;
}

Value textValue(CMPIType type, const std::string& text) {
    Value value;
    value.type = type;
    value.isNull = false;
    value.text = text;
    return value;
}

bool isText(CMPIType type) {
    return type == CMPI_string || type == CMPI_chars || type == CMPI_dateTime;
}

// The value without its type.
std::string valueText(const Value& value) {
    if (value.shape == Value::Shape::Missing) {
        return "missing";
    }
    if (value.shape == Value::Shape::WithoutHandle) {
        return "without handle";
    }
    if (value.isNull) {
        return "null";
    }
    if (isText(value.type)) {
        return '"' + value.text + '"';
    }
    if ((value.type & CMPI_ARRAY) == 0) {
        return value.text;
    }
    std::string text;
    for (const Value& element : value.elements) {
        text += (text.empty() ? "" : ",") + valueText(element);
    }
    return '{' + text + '}';
}

} // namespace

Value::Value(const char* value) : Value(Value::string(value)) {}
Value::Value(const std::string& value) : Value(Value::string(value)) {}

Value Value::nullOf(CMPIType type) {
    Value value;
    value.type = type;
    return value;
}

Value Value::missing(CMPIType type) {
    Value value = nullOf(type);
    value.isNull = false;
    value.shape = Shape::Missing;
    return value;
}

Value Value::withoutHandle(CMPIType type) {
    Value value = missing(type);
    value.shape = Shape::WithoutHandle;
    return value;
}

Value Value::string(const std::string& value) { return textValue(CMPI_string, value); }
Value Value::chars(const std::string& value) { return textValue(CMPI_chars, value); }
Value Value::dateTime(const std::string& text) { return textValue(CMPI_dateTime, text); }

Value Value::boolean(bool value) {
    Value result = textValue(CMPI_boolean, value ? "true" : "false");
    result.scalar.boolean = value ? 1 : 0;
    return result;
}

Value Value::uint8(CMPIUint8 value) { return numberValue(CMPI_uint8, &CMPIValue::uint8, value); }
Value Value::uint16(CMPIUint16 value) {
    return numberValue(CMPI_uint16, &CMPIValue::uint16, value);
}
Value Value::uint32(CMPIUint32 value) {
    return numberValue(CMPI_uint32, &CMPIValue::uint32, value);
}
Value Value::uint64(CMPIUint64 value) {
    return numberValue(CMPI_uint64, &CMPIValue::uint64, value);
}
Value Value::sint8(CMPISint8 value) { return numberValue(CMPI_sint8, &CMPIValue::sint8, value); }
Value Value::sint16(CMPISint16 value) {
    return numberValue(CMPI_sint16, &CMPIValue::sint16, value);
}
Value Value::sint32(CMPISint32 value) {
    return numberValue(CMPI_sint32, &CMPIValue::sint32, value);
}
Value Value::sint64(CMPISint64 value) {
    return numberValue(CMPI_sint64, &CMPIValue::sint64, value);
}
Value Value::real32(CMPIReal32 value) {
    return numberValue(CMPI_real32, &CMPIValue::real32, value);
}
Value Value::real64(CMPIReal64 value) {
    return numberValue(CMPI_real64, &CMPIValue::real64, value);
}

Value Value::ref(const Path& path) {
    Value value = textValue(CMPI_ref, path.toString());
    value.path = std::make_shared<const Path>(path);
    return value;
}

Value Value::embedded(const Instance& instance) {
    Value value = textValue(CMPI_instance, instance.toString());
    value.instance = std::make_shared<const Instance>(instance);
    return value;
}

Value Value::array(CMPIType elementType, const std::vector<Value>& elements) {
    Value value;
    value.type = static_cast<CMPIType>(elementType | CMPI_ARRAY);
    value.isNull = false;
    value.elements = elements;
    for (const Value& element : elements) {
        value.text += (value.text.empty() ? "" : ",") + (element.isNull ? "null" : element.text);
    }
    value.text = '{' + value.text + '}';
    return value;
}

std::string Value::describe() const { return typeName(type) + ',' + valueText(*this); }

const Value* Path::key(const std::string& name) const { return findByName(keys, name); }
std::string Path::keyText(const std::string& name) const { return textOf(key(name)); }
std::vector<std::string> Path::keyNames() const { return namesOf(keys); }

std::string Path::toString() const {
    std::string text = host.empty() ? "" : "//" + host + '/';
    text += nameSpace + ':' + className;
    char separator = '.';
    for (const NamedValue& entry : keys) {
        text += separator + entry.name + '=' + valueText(entry.value);
        separator = ',';
    }
    return text;
}

const Value* Instance::property(const std::string& name) const {
    return findByName(properties, name);
}
std::string Instance::propertyText(const std::string& name) const { return textOf(property(name)); }
std::vector<std::string> Instance::propertyNames() const { return namesOf(properties); }

std::string Instance::toString() const {
    std::string text = path.toString() + '\n';
    for (const NamedValue& entry : properties) {
        text += entry.name + '=' + entry.value.describe() + '\n';
    }
    return text;
}

std::string typeName(CMPIType type) {
    const CMPIType simple = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    for (const TypeName& entry : typeNames) {
        if (entry.type == simple) {
            return entry.name + std::string((type & CMPI_ARRAY) != 0 ? "[]" : "");
        }
    }
    std::array<char, 8> digits{};
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), type, 16);
    return "0x" + std::string(digits.data(), end.ptr);
}

std::ostream& operator<<(std::ostream& out, const Value& value) { return out << value.describe(); }
std::ostream& operator<<(std::ostream& out, const NamedValue& value) {
    return out << value.name << '=' << value.value;
}
std::ostream& operator<<(std::ostream& out, const Path& path) { return out << path.toString(); }
std::ostream& operator<<(std::ostream& out, const Instance& instance) {
    return out << instance.toString();
}

} // namespace qelo::test
