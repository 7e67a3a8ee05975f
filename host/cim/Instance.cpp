#include "Instance.h"

#include <algorithm>

namespace qelo::cim {

void Instance::setProperty(std::string_view name, Value value, std::string_view origin) {
    for (Property& property : properties_) {
        if (sameName(property.name, name)) {
            property.value = std::move(value);
            property.origin = origin;
            return;
        }
    }
    properties_.push_back({std::string(name), std::move(value), std::string(origin)});
}

const Value* Instance::property(std::string_view name) const {
    const auto found =
        std::find_if(properties_.begin(), properties_.end(),
                     [&](const Property& property) { return sameName(property.name, name); });
    return found == properties_.end() ? nullptr : &found->value;
}

bool operator==(const Instance& left, const Instance& right) {
    if (left.path() != right.path() || left.properties().size() != right.properties().size()) {
        return false;
    }
    return std::all_of(left.properties().begin(), left.properties().end(),
                       [&](const Instance::Property& property) {
                           const Value* other = right.property(property.name);
                           return other != nullptr && *other == property.value;
                       });
}

} // namespace qelo::cim
