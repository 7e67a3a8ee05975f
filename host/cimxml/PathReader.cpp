// Paths of classes and instances.
#include "ElementReader.h"

#include <cim/ValueParser.h>

#include <array>

namespace qelo::cimxml {
namespace {

constexpr std::size_t kMostKeys = 64;

void requireNumber(const Element& element, std::size_t count, std::size_t expected) {
    if (count != expected) {
        throw NotValid(element.name + " must have " + std::to_string(expected) +
                       " elements inside");
    }
}

std::string hostOf(const Element& nameSpacePath) {
    const Element& host = nameSpacePath.require("HOST");
    return std::string(trimmed(host.text));
}

// A number whose type is not told.
cim::Value numericKey(std::string_view text) {
    std::string error;
    for (const cim::Type type : {cim::Type::UInt64, cim::Type::SInt64, cim::Type::Real64}) {
        if (auto value = cim::parseValue(type, text, error)) {
            return *std::move(value);
        }
    }
    throw NotValid("KEYVALUE: " + error);
}

} // namespace

bool ElementReader::isPath(const Element& element) {
    constexpr std::array<std::string_view, 7> names = {
        "INSTANCENAME",   "LOCALINSTANCEPATH", "INSTANCEPATH", "CLASSNAME",
        "LOCALCLASSPATH", "CLASSPATH",         "OBJECTPATH"};
    for (const std::string_view name : names) {
        if (element.is(name)) {
            return true;
        }
    }
    return false;
}

std::string ElementReader::nameSpace(const Element& element) {
    if (!element.is("LOCALNAMESPACEPATH")) {
        throw NotValid("LOCALNAMESPACEPATH is expected instead of " + element.name);
    }
    std::string result;
    for (const Element& child : element.children) {
        if (!child.is("NAMESPACE")) {
            refuseChild(element, child);
        }
        result += result.empty() ? "" : "/";
        result += child.requiredAttribute("NAME");
    }
    if (result.empty()) {
        throw NotValid("LOCALNAMESPACEPATH names no namespace");
    }
    return result;
}

cim::ObjectPath ElementReader::path(const Element& element) {
    if (element.is("VALUE.REFERENCE") || element.is("OBJECTPATH")) {
        return path(element.onlyChild());
    }
    if (element.is("INSTANCENAME")) {
        return instanceName(element);
    }
    if (element.is("CLASSNAME")) {
        requireNumber(element, element.children.size(), 0);
        return {"", element.requiredAttribute("NAME")};
    }
    if (!isPath(element)) {
        throw NotValid(element.name + " is no path");
    }
    return located(element);
}

// A name behind the namespace in which it stands, with or without a host.
cim::ObjectPath ElementReader::located(const Element& element) {
    requireNumber(element, element.children.size(), 2);
    const Element& place = element.children.front();
    const Element& name = element.children.back();
    const bool ofClass = element.is("CLASSPATH") || element.is("LOCALCLASSPATH");
    if (!name.is(ofClass ? "CLASSNAME" : "INSTANCENAME")) {
        refuseChild(element, name);
    }
    cim::ObjectPath result = path(name);
    if (element.is("CLASSPATH") || element.is("INSTANCEPATH")) {
        if (!place.is("NAMESPACEPATH")) {
            refuseChild(element, place);
        }
        result.setHost(hostOf(place));
        result.setNameSpace(nameSpace(place.require("LOCALNAMESPACEPATH")));
    } else {
        result.setNameSpace(nameSpace(place));
    }
    return result;
}

// The keys stand in KEYBINDINGs; a single one may stand alone, without its name.
cim::ObjectPath ElementReader::instanceName(const Element& element) {
    cim::ObjectPath result("", element.requiredAttribute("CLASSNAME"));
    if (element.children.size() > kMostKeys) {
        throw NotValid("INSTANCENAME has too many keys");
    }
    for (const Element& child : element.children) {
        if (child.is("KEYBINDING")) {
            addKey(result, child);
            continue;
        }
        requireNumber(element, element.children.size(), 1);
        result.setKey("", keyValue(child));
    }
    return result;
}

void ElementReader::addKey(cim::ObjectPath& path, const Element& binding) {
    const std::string& name = binding.requiredAttribute("NAME");
    if (path.key(name) != nullptr) {
        throw NotValid("a key is given twice");
    }
    path.setKey(name, keyValue(binding.onlyChild()));
}

cim::Value ElementReader::keyValue(const Element& element) {
    if (element.is("VALUE.REFERENCE")) {
        return cim::Value::reference(path(element));
    }
    if (!element.is("KEYVALUE")) {
        throw NotValid(element.name + " is no key");
    }
    if (const auto type = typeOf(element, "TYPE")) {
        if (*type == cim::Type::Reference || *type == cim::Type::Instance) {
            throw NotValid("KEYVALUE cannot be of this type");
        }
        return textValue(element, *type);
    }
    const std::string_view kind = trimmed(element.attribute("VALUETYPE"));
    if (cim::sameName(kind, "numeric")) {
        return numericKey(trimmed(element.text));
    }
    if (!kind.empty() && !cim::sameName(kind, "string") && !cim::sameName(kind, "boolean")) {
        throw NotValid("KEYVALUE: no such VALUETYPE");
    }
    return textValue(element,
                     cim::sameName(kind, "boolean") ? cim::Type::Boolean : cim::Type::String);
}

} // namespace qelo::cimxml
