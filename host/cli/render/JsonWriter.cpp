// For programs: one array with an object for each instance. Values keep their types; what
// JSON has no form for (datetimes, references, infinite reals) is its text.
#include "Display.h"
#include "JsonValues.h"
#include "Writer.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace qelo::cli {
namespace {

OrderedJson instanceJson(const cim::Instance& instance);

// The number whose shortest form is the value's text, so that a real32 of 0.1 is written 0.1.
OrderedJson realJson(const cim::Value& value) {
    const std::string text = value.toText();
    double number = 0;
    std::from_chars(text.data(), text.data() + text.size(), number);
    return std::isfinite(value.asReal()) ? OrderedJson(number) : OrderedJson(text);
}

OrderedJson scalarJson(const cim::Value& value) {
    switch (value.type()) {
    case cim::Type::Boolean:
        return value.asBoolean();
    case cim::Type::UInt8:
    case cim::Type::UInt16:
    case cim::Type::UInt32:
    case cim::Type::UInt64:
        return value.asUnsigned();
    case cim::Type::SInt8:
    case cim::Type::SInt16:
    case cim::Type::SInt32:
    case cim::Type::SInt64:
        return value.asSigned();
    case cim::Type::Real32:
    case cim::Type::Real64:
        return realJson(value);
    case cim::Type::Instance:
        return instanceJson(value.asInstance());
    default:
        return value.toText();
    }
}

} // namespace

OrderedJson valueJson(const cim::Value& value) {
    if (value.isNull()) {
        return nullptr;
    }
    if (!value.isArray()) {
        return scalarJson(value);
    }
    OrderedJson elements = OrderedJson::array();
    for (const cim::Value& element : value.asArray()) {
        elements.push_back(element.isNull() ? OrderedJson(nullptr) : scalarJson(element));
    }
    return elements;
}

std::string dumped(const OrderedJson& json) {
    constexpr auto replace = OrderedJson::error_handler_t::replace;
    std::string text = json.dump(2, ' ', false, replace);
    std::string_view rest = text;
    while (!rest.empty()) {
        const std::string_view line = rest.substr(0, rest.find('\n'));
        if (!isDisplayable(line)) {
            return json.dump(2, ' ', true, replace);
        }
        rest.remove_prefix(std::min(line.size() + 1, rest.size()));
    }
    return text;
}

namespace {

OrderedJson headOf(const cim::ObjectPath& path) {
    OrderedJson object = OrderedJson::object();
    object["class"] = path.className();
    object["path"] = path.toText();
    return object;
}

OrderedJson pathJson(const cim::ObjectPath& path) {
    OrderedJson object = headOf(path);
    OrderedJson& keys = object["keys"] = OrderedJson::object();
    for (const auto& key : path.keys()) {
        keys[key.name] = valueJson(key.value);
    }
    return object;
}

OrderedJson instanceJson(const cim::Instance& instance) {
    OrderedJson object = headOf(instance.path());
    OrderedJson& properties = object["properties"] = OrderedJson::object();
    for (const auto& property : instance.properties()) {
        properties[property.name] = valueJson(property.value);
    }
    return object;
}

std::string indented(const std::string& text) {
    std::string result = "  ";
    for (const char c : text) {
        result += c;
        if (c == '\n') {
            result += "  ";
        }
    }
    return result;
}

class JsonWriter final : public Writer {
public:
    explicit JsonWriter(Output& output) : output_(output) {}

    void path(const cim::ObjectPath& path) override { add(pathJson(path)); }
    void instance(const cim::Instance& instance) override { add(instanceJson(instance)); }
    void finish() override { output_.write(empty_ ? "[]\n" : "\n]\n"); }

private:
    void add(const OrderedJson& item) {
        output_.write(empty_ ? "[\n" : ",\n");
        output_.write(indented(dumped(item)));
        empty_ = false;
    }

    Output& output_;
    bool empty_ = true;
};

} // namespace

std::unique_ptr<Writer> makeJsonWriter(Output& output) {
    return std::make_unique<JsonWriter>(output);
}

std::string methodResultJson(const client::MethodResult& result) {
    OrderedJson object = OrderedJson::object();
    object["returnValue"] = valueJson(result.returnValue);
    OrderedJson& out = object["out"] = OrderedJson::object();
    for (const auto& [name, value] : result.out) {
        out[name] = valueJson(value);
    }
    return dumped(object) + "\n";
}

} // namespace qelo::cli
