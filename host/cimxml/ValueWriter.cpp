#include "Characters.h"
#include "ElementWriter.h"

namespace qelo::cimxml {
namespace {

struct ContentOf {
    std::string& out;
    cim::Type type;

    void operator()(std::monostate) const {}
    void operator()(bool value) const { out += value ? "true" : "false"; }
    void operator()(std::uint64_t value) const {
        if (type == cim::Type::Char16) {
            appendText(out, cim::Value::unsignedInteger(type, value).toText());
        } else {
            appendNumber(out, value);
        }
    }
    void operator()(std::int64_t value) const { appendNumber(out, value); }
    void operator()(double value) const { out += cim::Value::real(type, value).toText(); }
    void operator()(const std::string& value) const { appendText(out, value); }
    void operator()(const cim::DateTime& value) const { out += value.text(); }
    void operator()(const std::shared_ptr<const cim::ObjectPath>& value) const {
        appendPath(out, *value);
    }
    void operator()(const std::shared_ptr<const cim::Instance>& value) const {
        std::string document;
        appendInstance(document, *value);
        appendText(out, document);
    }
    void operator()(const cim::Value::Array& elements) const {
        for (const cim::Value& element : elements) {
            if (element.isNull()) {
                out += "<VALUE.NULL/>";
            } else {
                appendValue(out, element);
            }
        }
    }
};

} // namespace

void appendValue(std::string& out, const cim::Value& value) {
    if (value.isNull()) {
        return;
    }
    const bool reference = value.type() == cim::Type::Reference;
    const std::string_view name = value.isArray() ? (reference ? "VALUE.REFARRAY>" : "VALUE.ARRAY>")
                                                  : (reference ? "VALUE.REFERENCE>" : "VALUE>");
    out += '<';
    out += name;
    std::visit(ContentOf{out, value.type()}, value.data());
    out += "</";
    out += name;
}

void appendType(std::string& out, std::string_view attribute, cim::Type type) {
    const bool embedded = type == cim::Type::Instance;
    appendAttribute(out, attribute, embedded ? "string" : cim::typeName(type));
    if (embedded) {
        out += " EmbeddedObject=\"instance\"";
    }
}

void appendArgument(std::string& out, std::string_view name, const cim::Value& value, bool typed) {
    out += "<PARAMVALUE";
    appendAttribute(out, "NAME", name);
    if (typed) {
        appendType(out, "PARAMTYPE", value.type());
    }
    out += '>';
    appendValue(out, value);
    out += "</PARAMVALUE>";
}

} // namespace qelo::cimxml
