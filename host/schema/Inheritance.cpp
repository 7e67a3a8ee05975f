#include "Inheritance.h"

#include "Mof.h"
#include "Names.h"

#include <cim/ObjectPath.h>

#include <unordered_map>
#include <utility>

namespace qelo::schema {
namespace {

constexpr std::size_t kMostFeatures = 4096;

using Places = std::unordered_map<std::string, std::size_t>;

// Where each name stands in a list; a name that stands there twice is refused.
template <class Item> Places placesOf(const std::vector<Item>& items, const std::string& where) {
    Places places;
    for (std::size_t i = 0; i < items.size(); ++i) {
        if (!places.emplace(foldedName(items[i].name), i).second) {
            throw SchemaError(where + " has " + items[i].name + " twice");
        }
    }
    return places;
}

const std::size_t* find(const Places& places, const std::string& name) {
    const auto found = places.find(foldedName(name));
    return found == places.end() ? nullptr : &found->second;
}

cim::Qualifier inherited(cim::Qualifier qualifier) {
    qualifier.propagated = true;
    return qualifier;
}

// `own` with what of `above` reaches it.
std::vector<cim::Qualifier> merged(std::vector<cim::Qualifier> own,
                                   const std::vector<cim::Qualifier>& above,
                                   const std::string& where) {
    const Places places = placesOf(own, where);
    for (const cim::Qualifier& qualifier : above) {
        if (!qualifier.flavor.toSubclass) {
            continue;
        }
        const std::size_t* place = find(places, qualifier.name);
        if (place == nullptr) {
            own.push_back(inherited(qualifier));
        } else if (!qualifier.flavor.overridable && own[*place].value != qualifier.value) {
            throw SchemaError(where + " must not change its qualifier " + qualifier.name);
        }
    }
    return own;
}

std::vector<cim::Qualifier> passedOn(const std::vector<cim::Qualifier>& above) {
    return merged({}, above, {});
}

// What "Override" names must be there, under the same name.
void checkOverride(const cim::TypedElement& own, bool found, const std::string& where) {
    const cim::Qualifier* qualifier = cim::findQualifier(own.qualifiers, "Override");
    if (qualifier == nullptr || qualifier->value.isNull()) {
        return;
    }
    const bool named = qualifier->value.type() == cim::Type::String &&
                       !qualifier->value.isArray() &&
                       cim::sameName(qualifier->value.asString(), own.name);
    if (!found || !named) {
        throw SchemaError(where + " overrides what its superclass does not have");
    }
}

bool sameShape(const cim::TypedElement& left, const cim::TypedElement& right) {
    return left.type == right.type && left.array == right.array &&
           left.arraySize == right.arraySize;
}

cim::PropertyDeclaration overriding(cim::PropertyDeclaration own,
                                    const cim::PropertyDeclaration& above,
                                    const std::string& where) {
    if (!sameShape(own, above)) {
        throw SchemaError(where + " has another type than in the superclass");
    }
    own.qualifiers = merged(std::move(own.qualifiers), above.qualifiers, where);
    if (own.defaultValue.isNull()) {
        own.defaultValue = above.defaultValue;
    }
    own.origin = above.origin;
    return own;
}

class Resolver {
public:
    Resolver(cim::Class declared, const cim::Class* superclass)
        : class_(std::move(declared)), above_(superclass) {}

    cim::Class result() {
        resolveQualifiers();
        resolveProperties();
        resolveMethods();
        if (class_.properties.size() + class_.methods.size() > kMostFeatures) {
            throw SchemaError("class " + class_.name + " has too many properties and methods");
        }
        return std::move(class_);
    }

private:
    std::string whereIs(const std::string& name) const { return class_.name + "." + name; }

    void resolveQualifiers() {
        static const std::vector<cim::Qualifier> none;
        class_.qualifiers = merged(std::move(class_.qualifiers),
                                   above_ != nullptr ? above_->qualifiers : none, class_.name);
        if (above_ != nullptr && class_.isAssociation() != above_->isAssociation()) {
            throw SchemaError("class " + class_.name + " and its superclass " + above_->name +
                              " must be associations both, or neither");
        }
    }

    // The superclass has none of this property.
    void checkNew(const cim::PropertyDeclaration& property, bool keysAbove) const {
        const std::string where = whereIs(property.name);
        checkOverride(property, false, where);
        if (keysAbove && cim::hasFlag(property.qualifiers, "Key")) {
            throw SchemaError(where + " must not be a new key: the superclass has its keys");
        }
    }

    void checkReference(const cim::PropertyDeclaration& property) const {
        if (property.type == cim::Type::Reference && !class_.isAssociation() &&
            !cim::hasFlag(class_.qualifiers, "Indication")) {
            throw SchemaError(whereIs(property.name) + " is a reference, but the class is not an "
                                                       "association");
        }
    }

    std::vector<cim::PropertyDeclaration> inheritedProperties() const {
        std::vector<cim::PropertyDeclaration> list;
        if (above_ == nullptr) {
            return list;
        }
        list = above_->properties;
        for (cim::PropertyDeclaration& property : list) {
            property.propagated = true;
            property.qualifiers = passedOn(property.qualifiers);
        }
        return list;
    }

    void resolveProperties() {
        placesOf(class_.properties, class_.name);
        std::vector<cim::PropertyDeclaration> all = inheritedProperties();
        const Places places = placesOf(all, class_.name);
        const bool keysAbove = hasKeys(all);
        for (cim::PropertyDeclaration& own : class_.properties) {
            checkReference(own);
            if (const std::size_t* place = find(places, own.name)) {
                const cim::PropertyDeclaration& above =
                    above_->properties[*place]; // inheritance keeps the order
                checkOverride(own, true, whereIs(own.name));
                all[*place] = overriding(std::move(own), above, whereIs(above.name));
            } else {
                checkNew(own, keysAbove);
                own.origin = class_.name;
                all.push_back(std::move(own));
            }
        }
        class_.properties = std::move(all);
    }

    static bool hasKeys(const std::vector<cim::PropertyDeclaration>& properties) {
        for (const cim::PropertyDeclaration& property : properties) {
            if (cim::hasFlag(property.qualifiers, "Key")) {
                return true;
            }
        }
        return false;
    }

    cim::MethodDeclaration overridingMethod(cim::MethodDeclaration own,
                                            const cim::MethodDeclaration& above) const {
        const std::string where = whereIs(own.name) + "()";
        bool same =
            own.returnType == above.returnType && own.parameters.size() == above.parameters.size();
        for (std::size_t i = 0; same && i < own.parameters.size(); ++i) {
            cim::ParameterDeclaration& parameter = own.parameters[i];
            same = cim::sameName(parameter.name, above.parameters[i].name) &&
                   sameShape(parameter, above.parameters[i]);
            parameter.qualifiers =
                merged(std::move(parameter.qualifiers), above.parameters[i].qualifiers, where);
        }
        if (!same) {
            throw SchemaError(where + " has another signature than in the superclass");
        }
        own.qualifiers = merged(std::move(own.qualifiers), above.qualifiers, where);
        own.origin = above.origin;
        return own;
    }

    void resolveMethods() {
        placesOf(class_.methods, class_.name);
        std::vector<cim::MethodDeclaration> all;
        if (above_ != nullptr) {
            all = above_->methods;
        }
        for (cim::MethodDeclaration& method : all) {
            method.propagated = true;
            method.qualifiers = passedOn(method.qualifiers);
        }
        const Places places = placesOf(all, class_.name);
        for (cim::MethodDeclaration& own : class_.methods) {
            placesOf(own.parameters, whereIs(own.name) + "()");
            if (const std::size_t* place = find(places, own.name)) {
                all[*place] = overridingMethod(std::move(own), above_->methods[*place]);
            } else {
                own.origin = class_.name;
                all.push_back(std::move(own));
            }
        }
        class_.methods = std::move(all);
    }

    cim::Class class_;
    const cim::Class* above_;
};

std::size_t weightOf(const cim::Value& value) {
    constexpr std::size_t pathWeight = 1024; // of a reference, generously
    if (value.isNull()) {
        return sizeof value;
    }
    std::size_t weight = sizeof value;
    if (value.isArray()) {
        for (const cim::Value& element : value.asArray()) {
            weight += weightOf(element);
        }
    } else if (value.type() == cim::Type::String) {
        weight += value.asString().size();
    } else if (value.type() == cim::Type::Reference) {
        weight += pathWeight;
    }
    return weight;
}

std::size_t weightOf(const std::vector<cim::Qualifier>& qualifiers) {
    std::size_t weight = 0;
    for (const cim::Qualifier& qualifier : qualifiers) {
        weight += sizeof qualifier + qualifier.name.size() + weightOf(qualifier.value);
    }
    return weight;
}

} // namespace

cim::Class resolved(cim::Class declared, const cim::Class* superclass) {
    return Resolver(std::move(declared), superclass).result();
}

std::size_t weightOf(const cim::Class& known) {
    std::size_t weight = sizeof known + weightOf(known.qualifiers);
    for (const cim::PropertyDeclaration& property : known.properties) {
        weight += sizeof property + weightOf(property.qualifiers) + weightOf(property.defaultValue);
    }
    for (const cim::MethodDeclaration& method : known.methods) {
        weight += sizeof method + weightOf(method.qualifiers);
        for (const cim::ParameterDeclaration& parameter : method.parameters) {
            weight += sizeof parameter + weightOf(parameter.qualifiers);
        }
    }
    return weight;
}

} // namespace qelo::schema
