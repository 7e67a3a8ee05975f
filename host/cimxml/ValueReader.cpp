// Values: VALUE and its kin.
#include "ElementReader.h"
#include "XmlReader.h"

#include <cim/ValueParser.h>

#include <algorithm>
#include <array>

namespace qelo::cimxml {
namespace {

bool isEmbedded(const Element& element) {
    for (const char* name : {"EmbeddedObject", "EMBEDDEDOBJECT"}) {
        const std::string_view kind = trimmed(element.attribute(name));
        if (cim::sameName(kind, "instance") || cim::sameName(kind, "object")) {
            return true;
        }
        if (!kind.empty()) {
            throw NotValid(element.name + ": no such embedded object");
        }
    }
    return false;
}

// White space around a number or a word is layout; in texts it counts, and one character may
// be nothing else.
std::string_view relevantText(cim::Type type, std::string_view text) {
    const bool verbatim =
        type == cim::Type::String || (type == cim::Type::Char16 && text.size() < 2);
    return verbatim ? text : trimmed(text);
}

void requireText(const Element& element) {
    if (!element.children.empty()) {
        refuseChild(element, element.children.front());
    }
}

} // namespace

std::optional<cim::Type> ElementReader::typeOf(const Element& element, std::string_view attribute) {
    const std::string_view name = trimmed(element.attribute(attribute));
    if (isEmbedded(element)) {
        return cim::Type::Instance;
    }
    if (name.empty()) {
        return std::nullopt;
    }
    if (cim::sameName(name, "reference")) {
        return cim::Type::Reference;
    }
    const auto type = cim::typeOfName(name);
    if (!type) {
        throw NotValid(element.name + ": no such type");
    }
    return type;
}

bool ElementReader::isValue(const Element& element) {
    constexpr std::array<std::string_view, 5> names = {"VALUE", "VALUE.ARRAY", "VALUE.REFERENCE",
                                                       "VALUE.REFARRAY", "VALUE.NULL"};
    for (const std::string_view name : names) {
        if (element.is(name)) {
            return true;
        }
    }
    return false;
}

cim::Value ElementReader::value(const Element& element, cim::Type type) {
    if (element.is("VALUE.NULL")) {
        return cim::Value::null(type);
    }
    if (element.is("VALUE.REFERENCE")) {
        return cim::Value::reference(path(element));
    }
    if (element.is("VALUE.REFARRAY")) {
        return arrayValue(element, cim::Type::Reference);
    }
    if (type == cim::Type::Reference) {
        throw NotValid(element.name + " cannot be a reference");
    }
    if (element.is("VALUE.ARRAY")) {
        return arrayValue(element, type);
    }
    if (!element.is("VALUE")) {
        throw NotValid(element.name + " is no value");
    }
    return type == cim::Type::Instance ? embedded(element) : textValue(element, type);
}

cim::Value ElementReader::textValue(const Element& element, cim::Type type) {
    requireText(element);
    std::string error;
    auto value = cim::parseValue(type, relevantText(type, element.text), error);
    if (!value) {
        throw NotValid(element.name + ": " + error);
    }
    return *std::move(value);
}

cim::Value ElementReader::arrayValue(const Element& element, cim::Type type) {
    cim::Value::Array elements;
    elements.reserve(element.children.size());
    const char* const expected = type == cim::Type::Reference ? "VALUE.REFERENCE" : "VALUE";
    for (const Element& child : element.children) {
        if (!child.is(expected) && !child.is("VALUE.NULL")) {
            refuseChild(element, child);
        }
        elements.push_back(value(child, type));
    }
    return cim::Value::array(type, std::move(elements));
}

Element ElementReader::embeddedDocument(std::string_view text, const XmlLimits& limits) {
    try {
        XmlReader reader(limits);
        reader.feed(text);
        Element root = reader.finish();
        embeddedElements_ += reader.elementsRead();
        return root;
    } catch (const NotWellFormed& error) {
        throw NotValid(std::string("embedded object: ") + error.what());
    }
}

// An instance as another document, whose mark-up is the text of this element.
cim::Value ElementReader::embedded(const Element& element) {
    requireText(element);
    if (trimmed(element.text).empty()) {
        return cim::Value::null(cim::Type::Instance);
    }
    XmlLimits limits;
    limits.depth = limits_.depth;
    limits.depthOutside = element.depth;
    limits.elements = limits_.elements - std::min(limits_.elements, embeddedElements_);
    const Element root = embeddedDocument(trimmed(element.text), limits);
    if (root.is("CLASS")) {
        throw NotValid("embedded classes are not accepted");
    }
    return cim::Value::instance(instance(root));
}

cim::Value ElementReader::content(const Element& element, cim::Type type, bool array) {
    const Element* found = nullptr;
    for (const Element& child : element.children) {
        if (child.is("QUALIFIER")) {
            continue;
        }
        const bool fits =
            isValue(child) && (child.is("VALUE.NULL") ||
                               (child.is("VALUE.ARRAY") || child.is("VALUE.REFARRAY")) == array);
        if (!fits || found != nullptr) {
            refuseChild(element, child);
        }
        found = &child;
    }
    if (found == nullptr || found->is("VALUE.NULL")) {
        return cim::Value::null(type, array);
    }
    cim::Value result = value(*found, type);
    if (result.type() != type) {
        refuseChild(element, *found);
    }
    return result;
}

// The attribute had another name in the first versions of the DTD.
ElementReader::Argument ElementReader::argument(const Element& element) {
    auto type = typeOf(element, "PARAMTYPE");
    type = type ? type : typeOf(element, "TYPE");
    if (element.children.empty()) {
        return {cim::Value::null(type.value_or(cim::Type::String)), type.has_value()};
    }
    const Element& child = element.onlyChild();
    cim::Value result =
        isValue(child) ? value(child, type.value_or(cim::Type::String)) : objectValue(child);
    if (type && result.type() != *type) {
        refuseChild(element, child);
    }
    const bool typed = type || result.type() != cim::Type::String;
    return {std::move(result), typed};
}

// A path or an instance that stands there as such.
cim::Value ElementReader::objectValue(const Element& element) {
    return isPath(element) ? cim::Value::reference(path(element))
                           : cim::Value::instance(instance(element));
}

} // namespace qelo::cimxml
