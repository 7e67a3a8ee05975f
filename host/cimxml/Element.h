// One element of an XML document with everything inside it.
#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace qelo::cimxml {

// A document that is well-formed but not what it must be. The text names the element.
class NotValid : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

struct Element {
    std::string name; // without a namespace prefix
    std::vector<std::pair<std::string, std::string>> attributes;
    std::string text; // all character data directly inside, joined
    std::vector<Element> children;
    std::size_t depth = 0; // 1 for the outermost one; goes on inside embedded documents

    bool is(std::string_view other) const { return name == other; }

    // The attribute of that name, or null.
    const std::string* findAttribute(std::string_view attributeName) const;
    // The same, empty when it is missing.
    std::string_view attribute(std::string_view attributeName) const;
    // The same, NotValid when it is missing or empty.
    const std::string& requiredAttribute(std::string_view attributeName) const;
    // Whether it says "true", in any case; `fallback` when it is missing or empty.
    bool flag(std::string_view attributeName, bool fallback) const;

    // The first child of that name, or null.
    const Element* find(std::string_view childName) const;
    // The same, NotValid when there is none.
    const Element& require(std::string_view childName) const;
    // The one and only child, NotValid when there are more or fewer.
    const Element& onlyChild() const;
};

// Says that `child` must not stand inside `parent`.
[[noreturn]] void refuseChild(const Element& parent, const Element& child);

// Without the white space of XML at both ends.
std::string_view trimmed(std::string_view text);

} // namespace qelo::cimxml
