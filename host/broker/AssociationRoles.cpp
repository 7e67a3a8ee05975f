#include "AssociationRoles.h"

#include <algorithm>

namespace qelo::broker {
namespace {

using Reference = std::pair<std::string, cim::ObjectPath>;

bool isReference(const cim::Value& value) {
    return value.type() == cim::Type::Reference && !value.isArray() && !value.isNull();
}

void addReference(std::vector<Reference>& list, const std::string& name, const cim::Value& value) {
    const auto known = [&](const Reference& other) { return cim::sameName(other.first, name); };
    if (isReference(value) && std::none_of(list.begin(), list.end(), known)) {
        list.emplace_back(name, value.asReference());
    }
}

// The same number may come as uint16 from one side and as uint64 from the other.
bool sameKeyValue(const cim::Value& left, const cim::Value& right) {
    return left == right || (!isReference(left) && left.toText() == right.toText());
}

bool fits(const std::string& wantedRole, const std::string& role) {
    return wantedRole.empty() || cim::sameName(wantedRole, role);
}

} // namespace

std::vector<Reference> referencesOf(const cim::Instance& association) {
    std::vector<Reference> list;
    for (const cim::Instance::Property& property : association.properties()) {
        addReference(list, property.name, property.value);
    }
    for (const cim::ObjectPath::Key& key : association.path().keys()) {
        addReference(list, key.name, key.value);
    }
    return list;
}

bool sameObject(const cim::ObjectPath& left, const cim::ObjectPath& right,
                const ClassTest& related) {
    if (left.keys().size() != right.keys().size() ||
        !related(left.className(), right.className())) {
        return false;
    }
    return std::all_of(left.keys().begin(), left.keys().end(), [&](const auto& key) {
        const cim::Value* other = right.key(key.name);
        return other && sameKeyValue(key.value, *other);
    });
}

bool playsRole(const cim::Instance& association, const cim::ObjectPath& source,
               const std::string& role, const ClassTest& related) {
    const std::vector<Reference> ends = referencesOf(association);
    return std::any_of(ends.begin(), ends.end(), [&](const Reference& end) {
        return fits(role, end.first) && sameObject(end.second, source, related);
    });
}

std::vector<cim::ObjectPath> otherEnds(const cim::Instance& association,
                                       const cim::ObjectPath& source, const std::string& role,
                                       const std::string& resultRole, const ClassTest& related) {
    const std::vector<Reference> ends = referencesOf(association);
    std::vector<cim::ObjectPath> others;
    for (const Reference& near : ends) {
        if (!fits(role, near.first) || !sameObject(near.second, source, related)) {
            continue;
        }
        for (const Reference& far : ends) {
            if (&far != &near && fits(resultRole, far.first)) {
                others.push_back(far.second);
            }
        }
    }
    return others;
}

} // namespace qelo::broker
