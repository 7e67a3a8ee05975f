// Instances, alone or beside their paths.
#include "ElementReader.h"

#include <algorithm>
#include <array>

namespace qelo::cimxml {
namespace {

char toLower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

bool nameIsLess(const std::string* left, const std::string* right) {
    return std::lexicographical_compare(left->begin(), left->end(), right->begin(), right->end(),
                                        [](char a, char b) { return toLower(a) < toLower(b); });
}

// Sorted, because a document may be full of names that are meant to take long.
void requireDistinctNames(const cim::Instance& instance) {
    std::vector<const std::string*> names;
    names.reserve(instance.properties().size());
    for (const auto& property : instance.properties()) {
        names.push_back(&property.name);
    }
    std::sort(names.begin(), names.end(), nameIsLess);
    const auto twice = std::adjacent_find(names.begin(), names.end(), [](auto* left, auto* right) {
        return cim::sameName(*left, *right);
    });
    if (twice != names.end()) {
        throw NotValid("a property is given twice");
    }
}

// What stands beside the object in one of the VALUE.* elements.
const Element& objectOf(const Element& element) {
    constexpr std::array<std::string_view, 6> wrappers = {
        "VALUE.NAMEDINSTANCE",       "VALUE.INSTANCEWITHPATH", "VALUE.OBJECTWITHPATH",
        "VALUE.OBJECTWITHLOCALPATH", "VALUE.NAMEDOBJECT",      "VALUE.OBJECT"};
    const bool wrapped =
        std::find(wrappers.begin(), wrappers.end(), element.name) != wrappers.end();
    if (!wrapped) {
        return element;
    }
    if (element.children.empty() || element.children.size() > 2) {
        throw NotValid(element.name + " must have an object and at most its path inside");
    }
    return element.children.back();
}

} // namespace

bool ElementReader::holdsClass(const Element& element) {
    return element.is("CLASS") || objectOf(element).is("CLASS");
}

cim::Instance ElementReader::instance(const Element& element) {
    const Element& object = objectOf(element);
    cim::Instance result = plainInstance(object);
    if (&object != &element && element.children.size() == 2) {
        cim::ObjectPath place = path(element.children.front());
        if (!cim::sameName(place.className(), result.className())) {
            throw NotValid(element.name + ": the classes of path and instance differ");
        }
        result.setPath(std::move(place));
    }
    return result;
}

cim::Instance ElementReader::plainInstance(const Element& element) {
    if (!element.is("INSTANCE")) {
        throw NotValid("INSTANCE is expected instead of " + element.name);
    }
    cim::Instance result(cim::ObjectPath("", element.requiredAttribute("CLASSNAME")));
    result.reserve(element.children.size());
    for (const Element& child : element.children) {
        if (!child.is("QUALIFIER")) {
            result.append(property(child));
        }
    }
    requireDistinctNames(result);
    return result;
}

cim::Instance::Property ElementReader::property(const Element& element) {
    cim::Instance::Property result;
    result.name = element.requiredAttribute("NAME");
    result.origin = element.attribute("CLASSORIGIN");
    if (element.is("PROPERTY.REFERENCE")) {
        result.value =
            content(element, cim::Type::Reference, element.find("VALUE.REFARRAY") != nullptr);
    } else if (element.is("PROPERTY") || element.is("PROPERTY.ARRAY")) {
        result.value = content(element, typeOf(element, "TYPE").value_or(cim::Type::String),
                               element.is("PROPERTY.ARRAY"));
    } else {
        throw NotValid(element.name + " is no property");
    }
    return result;
}

} // namespace qelo::cimxml
