// A CIM instance: its path and its properties in the order in which they were set.
#pragma once

#include "ObjectPath.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace qelo::cim {

class Instance {
public:
    struct Property {
        std::string name;
        Value value;
        std::string origin; // class of origin; empty when not known
    };

    Instance() = default;
    explicit Instance(ObjectPath path) : path_(std::move(path)) {}

    const ObjectPath& path() const { return path_; }
    void setPath(ObjectPath path) { path_ = std::move(path); }
    ObjectPath& mutablePath() { return path_; }

    const std::string& className() const { return path_.className(); }
    const std::vector<Property>& properties() const { return properties_; }

    // Adds, or replaces under the same name (names compare ignoring case).
    void setProperty(std::string_view name, Value value, std::string_view origin = {});
    const Value* property(std::string_view name) const; // or null

    // For whoever builds many instances and knows that no two names are the same: room for
    // `count` properties, and a property put at the end without looking for its name.
    void reserve(std::size_t count) { properties_.reserve(count); }
    void append(Property property) { properties_.push_back(std::move(property)); }

    // For whoever fills the same instance again and again. No two names may be the same.
    std::vector<Property>& mutableProperties() { return properties_; }

private:
    ObjectPath path_;
    std::vector<Property> properties_;
};

// Same path, and the same properties with equal values in any order. Origins do not count.
bool operator==(const Instance& left, const Instance& right);
inline bool operator!=(const Instance& left, const Instance& right) { return !(left == right); }

} // namespace qelo::cim
