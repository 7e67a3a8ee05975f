#include "LocalReferences.h"

#include <algorithm>

namespace qelo::server {
namespace {

// How deep references inside references are looked at; real ones end at the second.
constexpr int kDepth = 4;

bool holdsReference(const cim::Value& value) {
    return value.type() == cim::Type::Reference && !value.isNull();
}

template <class List> bool anyReference(const List& list) {
    return std::any_of(list.begin(), list.end(),
                       [](const auto& item) { return holdsReference(item.value); });
}

cim::ObjectPath localPath(const cim::ObjectPath& path, const std::string& host, int depth);

cim::Value localValue(const cim::Value& value, const std::string& host, int depth) {
    if (!holdsReference(value) || depth == 0) {
        return value;
    }
    if (value.isArray()) {
        cim::Value::Array elements;
        for (const cim::Value& element : value.asArray()) {
            elements.push_back(localValue(element, host, depth));
        }
        return cim::Value::array(cim::Type::Reference, std::move(elements));
    }
    cim::ObjectPath path = localPath(value.asReference(), host, depth - 1);
    if (cim::sameName(path.host(), host)) {
        path.setHost({});
    }
    return cim::Value::reference(std::move(path));
}

cim::ObjectPath localPath(const cim::ObjectPath& path, const std::string& host, int depth) {
    cim::ObjectPath result = path;
    for (const auto& key : path.keys()) {
        if (holdsReference(key.value)) {
            result.setKey(key.name, localValue(key.value, host, depth));
        }
    }
    return result;
}

} // namespace

std::optional<cim::ObjectPath> withLocalReferences(const cim::ObjectPath& path,
                                                   const std::string& host) {
    return anyReference(path.keys()) ? std::make_optional(localPath(path, host, kDepth))
                                     : std::nullopt;
}

std::optional<cim::Instance> withLocalReferences(const cim::Instance& instance,
                                                 const std::string& host) {
    if (!anyReference(instance.properties()) && !anyReference(instance.path().keys())) {
        return std::nullopt;
    }
    cim::Instance result(localPath(instance.path(), host, kDepth));
    for (const auto& property : instance.properties()) {
        result.append({property.name, localValue(property.value, host, kDepth), property.origin});
    }
    return result;
}

} // namespace qelo::server
