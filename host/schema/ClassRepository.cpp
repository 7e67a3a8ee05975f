#include "ClassRepository.h"

#include "ClassEquality.h"
#include "Inheritance.h"
#include "Mof.h"
#include "Names.h"

#include <algorithm>
#include <deque>
#include <unordered_map>
#include <utility>

namespace qelo::schema {
namespace {

// Inheritance multiplies: every subclass repeats what it inherits. No sound schema comes near.
constexpr std::size_t kLargestRepository = 256U << 20U;
constexpr std::size_t kDeepestInheritance = 64;

struct Node {
    cim::Class declared;
    cim::Class resolved;
    const Node* superclass = nullptr;
    std::size_t depth = 1;
    std::size_t weight = 0;
    std::vector<const Node*> subclasses;
    std::deque<cim::Instance> instances; // never moved: find() hands out pointers
};

struct NameSpace {
    std::string name;
    std::unordered_map<std::string, std::unique_ptr<Node>> classes;
    std::vector<const Node*> roots;
    std::unordered_map<std::string, std::unique_ptr<cim::QualifierType>> qualifierTypes;
    std::vector<const cim::QualifierType*> qualifierOrder;

    Node* find(std::string_view className) const {
        const auto found = classes.find(foldedName(className));
        return found == classes.end() ? nullptr : found->second.get();
    }
};

void checkInstance(const cim::Instance& instance, const cim::Class& known) {
    if (known.isAbstract()) {
        throw SchemaError("class " + known.name + " is abstract and has no instances");
    }
    for (const cim::Instance::Property& property : instance.properties()) {
        const cim::PropertyDeclaration* declared = known.property(property.name);
        if (declared == nullptr || declared->type != property.value.type() ||
            declared->array != property.value.isArray()) {
            throw SchemaError("class " + known.name + " has no property " + property.name +
                              " of that type");
        }
    }
}

// Every property that has a value, in the order of the class, and a path with all keys.
cim::Instance completed(const cim::Instance& given, const cim::Class& known,
                        const std::string& nameSpace) {
    cim::Instance instance(cim::ObjectPath(nameSpace, known.name));
    for (const cim::PropertyDeclaration& property : known.properties) {
        const cim::Value* own = given.property(property.name);
        const cim::Value& value = own != nullptr ? *own : property.defaultValue;
        if (cim::hasFlag(property.qualifiers, "Key")) {
            if (value.isNull()) {
                throw SchemaError("the instance has no value for the key " + property.name);
            }
            instance.mutablePath().setKey(property.name, value);
        }
        if (own != nullptr || !value.isNull()) {
            instance.append({property.name, value, property.origin});
        }
    }
    return instance;
}

} // namespace

class ClassRepository::Impl {
public:
    const NameSpace* find(std::string_view nameSpace) const {
        const std::string folded = foldedNameSpace(nameSpace);
        for (const NameSpace& known : nameSpaces) {
            if (foldedNameSpace(known.name) == folded) {
                return &known;
            }
        }
        return nullptr;
    }

    NameSpace& added(std::string_view nameSpace) {
        if (const NameSpace* known = find(nameSpace)) {
            return const_cast<NameSpace&>(*known);
        }
        nameSpaces.emplace_back();
        nameSpaces.back().name = trimmed(nameSpace);
        return nameSpaces.back();
    }

    const Node* find(std::string_view nameSpace, std::string_view className) const {
        const NameSpace* known = find(nameSpace);
        return known == nullptr ? nullptr : known->find(className);
    }

    // Refuses what would make the repository too large, before it is made.
    void reserve(std::size_t bytes) {
        if (bytes > kLargestRepository - size) {
            throw SchemaError("the schema is too large");
        }
        size += bytes;
    }

    static std::string trimmed(std::string_view nameSpace) {
        const std::size_t first = nameSpace.find_first_not_of('/');
        if (first == std::string_view::npos) {
            throw SchemaError("a namespace without a name");
        }
        return std::string(nameSpace.substr(first, nameSpace.find_last_not_of('/') + 1 - first));
    }

    std::deque<NameSpace> nameSpaces;
    std::size_t size = 0;
};

ClassRepository::ClassRepository() : impl_(std::make_unique<Impl>()) {}
ClassRepository::~ClassRepository() = default;
ClassRepository::ClassRepository(ClassRepository&&) noexcept = default;
ClassRepository& ClassRepository::operator=(ClassRepository&&) noexcept = default;

void ClassRepository::addNameSpace(std::string_view nameSpace) { impl_->added(nameSpace); }

bool ClassRepository::hasNameSpace(std::string_view nameSpace) const {
    return impl_->find(nameSpace) != nullptr;
}

std::vector<std::string> ClassRepository::nameSpaces() const {
    std::vector<std::string> names;
    for (const NameSpace& known : impl_->nameSpaces) {
        names.push_back(known.name);
    }
    return names;
}

void ClassRepository::add(std::string_view nameSpace, cim::Class declared) {
    NameSpace& place = impl_->added(nameSpace);
    if (const Node* known = place.find(declared.name)) {
        if (!sameDeclaration(known->declared, declared)) {
            throw SchemaError("class " + declared.name + " is there already, declared otherwise");
        }
        return;
    }
    Node* superclass = nullptr;
    if (!declared.superclass.empty()) {
        superclass = place.find(declared.superclass);
        if (superclass == nullptr) {
            throw SchemaError("the superclass " + declared.superclass + " of class " +
                              declared.name + " is not known");
        }
    }
    auto node = std::make_unique<Node>();
    if (superclass != nullptr) {
        node->depth = superclass->depth + 1;
        declared.superclass = superclass->declared.name;
    }
    if (node->depth > kDeepestInheritance) {
        throw SchemaError("class " + declared.name + " has too many superclasses");
    }
    node->weight = weightOf(declared) * 2 + (superclass != nullptr ? superclass->weight : 0);
    impl_->reserve(node->weight);
    node->superclass = superclass;
    node->resolved = resolved(declared, superclass == nullptr ? nullptr : &superclass->resolved);
    node->declared = std::move(declared);
    (superclass == nullptr ? place.roots : superclass->subclasses).push_back(node.get());
    place.classes.emplace(foldedName(node->declared.name), std::move(node));
}

void ClassRepository::add(std::string_view nameSpace, cim::QualifierType type) {
    NameSpace& place = impl_->added(nameSpace);
    const std::string key = foldedName(type.name);
    const auto known = place.qualifierTypes.find(key);
    if (known != place.qualifierTypes.end()) {
        if (!sameDeclaration(*known->second, type)) {
            throw SchemaError("the qualifier " + type.name +
                              " is there already, declared otherwise");
        }
        return;
    }
    auto kept = std::make_unique<cim::QualifierType>(std::move(type));
    place.qualifierOrder.push_back(kept.get());
    place.qualifierTypes.emplace(key, std::move(kept));
}

cim::ObjectPath ClassRepository::add(std::string_view nameSpace, const cim::Instance& instance) {
    NameSpace& place = impl_->added(nameSpace);
    Node* node = place.find(instance.className());
    if (node == nullptr) {
        throw SchemaError("no such class: " + instance.className());
    }
    checkInstance(instance, node->resolved);
    impl_->reserve(node->weight);
    cim::Instance whole = completed(instance, node->resolved, place.name);
    for (const cim::Instance& other : node->instances) {
        if (other.path() == whole.path()) {
            if (other != whole) {
                throw SchemaError("the instance " + whole.path().toText() +
                                  " is there already, with other values");
            }
            return other.path();
        }
    }
    node->instances.push_back(std::move(whole));
    return node->instances.back().path();
}

const cim::Class* ClassRepository::find(std::string_view nameSpace,
                                        std::string_view className) const {
    const Node* node = impl_->find(nameSpace, className);
    return node == nullptr ? nullptr : &node->resolved;
}

const cim::QualifierType* ClassRepository::findQualifierType(std::string_view nameSpace,
                                                             std::string_view name) const {
    const NameSpace* place = impl_->find(nameSpace);
    if (place == nullptr) {
        return nullptr;
    }
    const auto found = place->qualifierTypes.find(foldedName(name));
    return found == place->qualifierTypes.end() ? nullptr : found->second.get();
}

std::vector<const cim::QualifierType*>
ClassRepository::qualifierTypes(std::string_view nameSpace) const {
    const NameSpace* place = impl_->find(nameSpace);
    return place == nullptr ? std::vector<const cim::QualifierType*>() : place->qualifierOrder;
}

bool ClassRepository::isA(std::string_view nameSpace, std::string_view sub,
                          std::string_view super) const {
    const Node* above = impl_->find(nameSpace, super);
    const Node* node = above == nullptr ? nullptr : impl_->find(nameSpace, sub);
    while (node != nullptr && node != above) {
        node = node->superclass;
    }
    return node != nullptr;
}

std::vector<const cim::Class*> ClassRepository::subclasses(std::string_view nameSpace,
                                                           std::string_view className,
                                                           bool deep) const {
    const NameSpace* place = impl_->find(nameSpace);
    if (place == nullptr) {
        return {};
    }
    const Node* start = className.empty() ? nullptr : place->find(className);
    if (start == nullptr && !className.empty()) {
        return {};
    }
    std::vector<const Node*> found = start == nullptr ? place->roots : start->subclasses;
    for (std::size_t i = 0; deep && i < found.size(); ++i) {
        const std::vector<const Node*>& below = found[i]->subclasses;
        found.insert(found.end(), below.begin(), below.end());
    }
    std::vector<const cim::Class*> classes;
    classes.reserve(found.size());
    for (const Node* node : found) {
        classes.push_back(&node->resolved);
    }
    return classes;
}

std::vector<std::string> ClassRepository::keyNames(const cim::Class& known) const {
    std::vector<std::string> names;
    for (const cim::PropertyDeclaration& property : known.properties) {
        if (cim::hasFlag(property.qualifiers, "Key")) {
            names.push_back(property.name);
        }
    }
    return names;
}

std::vector<const cim::Instance*> ClassRepository::instances(std::string_view nameSpace,
                                                             std::string_view className) const {
    std::vector<const cim::Instance*> found;
    if (const Node* node = impl_->find(nameSpace, className)) {
        for (const cim::Instance& instance : node->instances) {
            found.push_back(&instance);
        }
    }
    return found;
}

} // namespace qelo::schema
