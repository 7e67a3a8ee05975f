#include "Element.h"

#include <cim/ObjectPath.h>

#include <algorithm>

namespace qelo::cimxml {

const std::string* Element::findAttribute(std::string_view attributeName) const {
    const auto found = std::find_if(attributes.begin(), attributes.end(),
                                    [&](const auto& item) { return item.first == attributeName; });
    return found == attributes.end() ? nullptr : &found->second;
}

std::string_view Element::attribute(std::string_view attributeName) const {
    const std::string* found = findAttribute(attributeName);
    return found == nullptr ? std::string_view() : std::string_view(*found);
}

const std::string& Element::requiredAttribute(std::string_view attributeName) const {
    const std::string* found = findAttribute(attributeName);
    if (found == nullptr || found->empty()) {
        throw NotValid(name + " lacks the attribute " + std::string(attributeName));
    }
    return *found;
}

bool Element::flag(std::string_view attributeName, bool fallback) const {
    const std::string_view value = trimmed(attribute(attributeName));
    if (value.empty()) {
        return fallback;
    }
    if (!cim::sameName(value, "true") && !cim::sameName(value, "false")) {
        throw NotValid(name + ": " + std::string(attributeName) + " is neither true nor false");
    }
    return cim::sameName(value, "true");
}

const Element* Element::find(std::string_view childName) const {
    const auto found = std::find_if(children.begin(), children.end(),
                                    [&](const Element& child) { return child.is(childName); });
    return found == children.end() ? nullptr : &*found;
}

const Element& Element::require(std::string_view childName) const {
    const Element* found = find(childName);
    if (found == nullptr) {
        throw NotValid(name + " lacks the element " + std::string(childName));
    }
    return *found;
}

const Element& Element::onlyChild() const {
    if (children.size() != 1) {
        throw NotValid(name + " must have exactly one element inside");
    }
    return children.front();
}

void refuseChild(const Element& parent, const Element& child) {
    throw NotValid(child.name + " must not stand inside " + parent.name);
}

std::string_view trimmed(std::string_view text) {
    constexpr std::string_view kSpace = " \t\r\n";
    const std::size_t first = text.find_first_not_of(kSpace);
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(kSpace) - first + 1);
}

} // namespace qelo::cimxml
