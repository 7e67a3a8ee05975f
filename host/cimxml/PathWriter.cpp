#include "Characters.h"
#include "ElementWriter.h"

#include <algorithm>

namespace qelo::cimxml {
namespace {

std::string_view valueType(cim::Type type) {
    switch (type) {
    case cim::Type::Boolean:
        return "boolean";
    case cim::Type::Char16:
    case cim::Type::String:
    case cim::Type::DateTime:
    case cim::Type::Reference:
    case cim::Type::Instance:
        return "string";
    default:
        return "numeric";
    }
}

// Key properties are scalars; anything else is shown as text rather than left out.
void addKeyValue(Pieces& out, const cim::Value& value) {
    if (value.type() == cim::Type::Reference && !value.isNull() && !value.isArray()) {
        addValue(out, value);
        return;
    }
    const bool scalar = !value.isArray() && !value.isNull() && value.type() != cim::Type::Instance;
    const cim::Type type = scalar ? value.type() : cim::Type::String;
    out.add("<KEYVALUE VALUETYPE=\"");
    out.add(valueType(type));
    out.add("\" TYPE=\"");
    out.add(cim::typeName(type));
    out.add("\">");
    if (scalar) {
        addContent(out, value);
    } else {
        out.addText(value.toText());
    }
    out.add("</KEYVALUE>");
}

void appendClassName(std::string& out, std::string_view name) {
    out += "<CLASSNAME";
    appendAttribute(out, "NAME", name);
    out += "/>";
}

// The class or instance itself.
void appendName(std::string& out, const cim::ObjectPath& path) {
    if (path.keys().empty()) {
        appendClassName(out, path.className());
    } else {
        appendInstanceName(out, path);
    }
}

void appendNameSpacePath(std::string& out, std::string_view host, std::string_view nameSpace) {
    out += "<NAMESPACEPATH><HOST>";
    appendText(out, host);
    out += "</HOST>";
    appendLocalNameSpace(out, nameSpace);
    out += "</NAMESPACEPATH>";
}

std::string_view either(std::string_view first, std::string_view otherwise) {
    return first.empty() ? otherwise : first;
}

} // namespace

void appendLocalNameSpace(std::string& out, std::string_view nameSpace) {
    out += "<LOCALNAMESPACEPATH>";
    while (!nameSpace.empty()) {
        const std::size_t length = std::min(nameSpace.find('/'), nameSpace.size());
        if (length > 0) {
            out += "<NAMESPACE";
            appendAttribute(out, "NAME", nameSpace.substr(0, length));
            out += "/>";
        }
        nameSpace.remove_prefix(std::min(length + 1, nameSpace.size()));
    }
    out += "</LOCALNAMESPACEPATH>";
}

void addInstanceName(Pieces& out, const cim::ObjectPath& path) {
    out.add("<INSTANCENAME CLASSNAME=\"");
    out.addAttributeText(path.className());
    out.add("\">");
    for (const auto& key : path.keys()) {
        if (key.name.empty()) {
            addKeyValue(out, key.value);
            continue;
        }
        out.add("<KEYBINDING NAME=\"");
        out.addAttributeText(key.name);
        out.add("\">");
        addKeyValue(out, key.value);
        out.add("</KEYBINDING>");
    }
    out.add("</INSTANCENAME>");
}

void appendInstanceName(std::string& out, const cim::ObjectPath& path) {
    Pieces pieces(out);
    addInstanceName(pieces, path);
    pieces.flush();
}

void appendInstancePath(std::string& out, const cim::ObjectPath& path, std::string_view host,
                        std::string_view nameSpace) {
    out += "<INSTANCEPATH>";
    appendNameSpacePath(out, either(path.host(), host), either(path.nameSpace(), nameSpace));
    appendInstanceName(out, path);
    out += "</INSTANCEPATH>";
}

void appendFullPath(std::string& out, const cim::ObjectPath& path, std::string_view host,
                    std::string_view nameSpace) {
    if (!path.keys().empty()) {
        appendInstancePath(out, path, host, nameSpace);
        return;
    }
    out += "<CLASSPATH>";
    appendNameSpacePath(out, either(path.host(), host), either(path.nameSpace(), nameSpace));
    appendClassName(out, path.className());
    out += "</CLASSPATH>";
}

void appendPath(std::string& out, const cim::ObjectPath& path) {
    if (path.nameSpace().empty()) {
        appendName(out, path);
    } else if (!path.host().empty()) {
        appendFullPath(out, path, {}, {});
    } else {
        const bool instance = !path.keys().empty();
        out += instance ? "<LOCALINSTANCEPATH>" : "<LOCALCLASSPATH>";
        appendLocalNameSpace(out, path.nameSpace());
        appendName(out, path);
        out += instance ? "</LOCALINSTANCEPATH>" : "</LOCALCLASSPATH>";
    }
}

} // namespace qelo::cimxml
