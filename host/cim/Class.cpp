#include "Class.h"

#include "ObjectPath.h"

#include <algorithm>

namespace qelo::cim {
namespace {

template <class List> auto* findNamed(const List& list, std::string_view name) {
    const auto found = std::find_if(list.begin(), list.end(),
                                    [&](const auto& item) { return sameName(item.name, name); });
    return found == list.end() ? nullptr : &*found;
}

} // namespace

const Qualifier* findQualifier(const std::vector<Qualifier>& qualifiers, std::string_view name) {
    return findNamed(qualifiers, name);
}

bool hasFlag(const std::vector<Qualifier>& qualifiers, std::string_view name) {
    const Qualifier* qualifier = findQualifier(qualifiers, name);
    return qualifier != nullptr && std::holds_alternative<bool>(qualifier->value.data()) &&
           qualifier->value.asBoolean();
}

const PropertyDeclaration* Class::property(std::string_view propertyName) const {
    return findNamed(properties, propertyName);
}

const MethodDeclaration* Class::method(std::string_view methodName) const {
    return findNamed(methods, methodName);
}

} // namespace qelo::cim
