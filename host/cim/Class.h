// A CIM class declaration (DMTF DSP0004): its qualifiers, properties and methods. Plain data,
// made by whoever reads a schema and immutable for everybody else.
#pragma once

#include "Value.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::cim {

// What a qualifier does to subclasses. The defaults are those of the standard.
struct QualifierFlavor {
    bool overridable = true;
    bool toSubclass = true;
    bool translatable = false;
};

struct Qualifier {
    std::string name;
    Value value; // typed; a flag such as Key has boolean true
    QualifierFlavor flavor;
    bool propagated = false; // inherited from the superclass
};

// The declaration of a qualifier: "Qualifier Key : boolean = false, Scope(property) ...".
struct QualifierType {
    enum Scope : std::uint32_t {
        ScopeClass = 1,
        ScopeAssociation = 2,
        ScopeIndication = 4,
        ScopeProperty = 8,
        ScopeReference = 16,
        ScopeMethod = 32,
        ScopeParameter = 64,
        ScopeAny = 127,
    };
    std::string name;
    Type type = Type::Boolean;
    bool array = false;
    std::optional<std::uint32_t> arraySize;
    Value defaultValue; // may be null
    std::uint32_t scopes = 0;
    QualifierFlavor flavor;
};

// What properties, references and parameters have in common.
struct TypedElement {
    std::string name;
    Type type = Type::String;
    bool array = false;
    std::optional<std::uint32_t> arraySize; // of a fixed-size array
    std::string referenceClass;             // of a reference: the class it must point to
    std::vector<Qualifier> qualifiers;
};

struct PropertyDeclaration : TypedElement {
    Value defaultValue; // null when there is none
    std::string origin; // the class that introduced it
    bool propagated = false;
};

struct ParameterDeclaration : TypedElement {};

struct MethodDeclaration {
    std::string name;
    Type returnType = Type::UInt32;
    std::vector<ParameterDeclaration> parameters;
    std::vector<Qualifier> qualifiers;
    std::string origin;
    bool propagated = false;
};

// The qualifier of that name (ignoring case), or null.
const Qualifier* findQualifier(const std::vector<Qualifier>& qualifiers, std::string_view name);

// Whether a boolean qualifier of that name is there and true.
bool hasFlag(const std::vector<Qualifier>& qualifiers, std::string_view name);

struct Class {
    std::string name;
    std::string superclass; // empty: none
    std::vector<Qualifier> qualifiers;
    std::vector<PropertyDeclaration> properties; // references included
    std::vector<MethodDeclaration> methods;

    // Each null when the class has none of that name (ignoring case).
    const PropertyDeclaration* property(std::string_view propertyName) const;
    const MethodDeclaration* method(std::string_view methodName) const;

    bool isAssociation() const { return hasFlag(qualifiers, "Association"); }
    bool isAbstract() const { return hasFlag(qualifiers, "Abstract"); }
};

} // namespace qelo::cim
