#include "Characters.h"
#include "ElementWriter.h"

namespace qelo::cimxml {
namespace {

struct ContentOf {
    Pieces& out;
    cim::Type type;

    void operator()(std::monostate) const {}
    void operator()(bool value) const { out.add(value ? "true" : "false"); }
    void operator()(std::uint64_t value) const {
        if (type == cim::Type::Char16) {
            out.addText(cim::Value::unsignedInteger(type, value).toText());
        } else {
            out.addNumber(value);
        }
    }
    void operator()(std::int64_t value) const { out.addNumber(value); }
    void operator()(double value) const { out.add(cim::Value::real(type, value).toText()); }
    void operator()(const std::string& value) const { out.addText(value); }
    void operator()(const cim::DateTime& value) const { out.add(value.text()); }
    void operator()(const std::shared_ptr<const cim::ObjectPath>& value) const {
        appendPath(out.flush(), *value);
    }
    void operator()(const std::shared_ptr<const cim::Instance>& value) const {
        std::string document;
        appendInstance(document, *value);
        out.addText(document);
    }
    void operator()(const cim::Value::Array& elements) const {
        for (const cim::Value& element : elements) {
            if (element.isNull()) {
                out.add("<VALUE.NULL/>");
            } else {
                addValue(out, element);
            }
        }
    }
};

struct Tags {
    std::string_view begin;
    std::string_view end;
};

Tags tagsOf(const cim::Value& value) {
    if (value.type() == cim::Type::Reference) {
        return value.isArray() ? Tags{"<VALUE.REFARRAY>", "</VALUE.REFARRAY>"}
                               : Tags{"<VALUE.REFERENCE>", "</VALUE.REFERENCE>"};
    }
    return value.isArray() ? Tags{"<VALUE.ARRAY>", "</VALUE.ARRAY>"} : Tags{"<VALUE>", "</VALUE>"};
}

} // namespace

void addContent(Pieces& out, const cim::Value& value) {
    std::visit(ContentOf{out, value.type()}, value.data());
}

void addValue(Pieces& out, const cim::Value& value) {
    if (value.isNull()) {
        return;
    }
    const Tags tags = tagsOf(value);
    out.add(tags.begin);
    addContent(out, value);
    out.add(tags.end);
}

void appendValue(std::string& out, const cim::Value& value) {
    Pieces pieces(out);
    addValue(pieces, value);
    pieces.flush();
}

void addType(Pieces& out, std::string_view attribute, cim::Type type) {
    const bool embedded = type == cim::Type::Instance;
    // Nothing in these names needs an escape.
    out.add(" ");
    out.add(attribute);
    out.add("=\"");
    out.add(embedded ? "string" : cim::typeName(type));
    out.add(embedded ? "\" EmbeddedObject=\"instance\"" : "\"");
}

void appendType(std::string& out, std::string_view attribute, cim::Type type) {
    Pieces pieces(out);
    addType(pieces, attribute, type);
    pieces.flush();
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
