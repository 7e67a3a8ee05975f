// Declarations: classes, their elements, and types of qualifiers.
#include "ElementReader.h"

#include <cim/ValueParser.h>

namespace qelo::cimxml {
namespace {

using cim::QualifierType;

cim::QualifierFlavor flavorOf(const Element& element) {
    cim::QualifierFlavor flavor;
    flavor.overridable = element.flag("OVERRIDABLE", true);
    flavor.toSubclass = element.flag("TOSUBCLASS", true);
    flavor.translatable = element.flag("TRANSLATABLE", false);
    return flavor;
}

std::optional<std::uint32_t> arraySizeOf(const Element& element) {
    const std::string_view text = trimmed(element.attribute("ARRAYSIZE"));
    if (text.empty()) {
        return std::nullopt;
    }
    std::string error;
    const auto size = cim::parseValue(cim::Type::UInt32, text, error);
    if (!size) {
        throw NotValid(element.name + ": ARRAYSIZE: " + error);
    }
    return static_cast<std::uint32_t>(size->asUnsigned());
}

// Name, type and array size of what is declared; qualifiers are added by the caller.
void readTyped(const Element& element, bool reference, bool array, cim::TypedElement& result) {
    result.name = element.requiredAttribute("NAME");
    result.array = array;
    result.arraySize = arraySizeOf(element);
    result.referenceClass = element.attribute("REFERENCECLASS");
    result.type = reference ? cim::Type::Reference
                            : ElementReader::typeOf(element, "TYPE").value_or(cim::Type::String);
}

std::uint32_t scopesOf(const Element& scope) {
    constexpr std::pair<const char*, std::uint32_t> kScopes[] = {
        {"CLASS", QualifierType::ScopeClass},
        {"ASSOCIATION", QualifierType::ScopeAssociation},
        {"REFERENCE", QualifierType::ScopeReference},
        {"PROPERTY", QualifierType::ScopeProperty},
        {"METHOD", QualifierType::ScopeMethod},
        {"PARAMETER", QualifierType::ScopeParameter},
        {"INDICATION", QualifierType::ScopeIndication}};
    std::uint32_t scopes = 0;
    for (const auto& [name, bit] : kScopes) {
        scopes |= scope.flag(name, false) ? bit : 0;
    }
    return scopes;
}

} // namespace

cim::Qualifier ElementReader::qualifier(const Element& element) {
    cim::Qualifier result;
    result.name = element.requiredAttribute("NAME");
    result.propagated = element.flag("PROPAGATED", false);
    result.flavor = flavorOf(element);
    result.value = content(element, typeOf(element, "TYPE").value_or(cim::Type::String),
                           element.find("VALUE.ARRAY") != nullptr);
    return result;
}

cim::PropertyDeclaration ElementReader::propertyDeclaration(const Element& element) {
    cim::PropertyDeclaration result;
    const bool reference = element.is("PROPERTY.REFERENCE");
    readTyped(element, reference, element.is("PROPERTY.ARRAY"), result);
    result.origin = element.attribute("CLASSORIGIN");
    result.propagated = element.flag("PROPAGATED", false);
    result.defaultValue = content(element, result.type, result.array);
    for (const Element& child : element.children) {
        if (child.is("QUALIFIER")) {
            result.qualifiers.push_back(qualifier(child));
        }
    }
    return result;
}

cim::ParameterDeclaration ElementReader::parameterDeclaration(const Element& element) {
    cim::ParameterDeclaration result;
    const bool referenceArray = element.is("PARAMETER.REFARRAY");
    readTyped(element, referenceArray || element.is("PARAMETER.REFERENCE"),
              referenceArray || element.is("PARAMETER.ARRAY"), result);
    for (const Element& child : element.children) {
        result.qualifiers.push_back(qualifier(child));
    }
    return result;
}

cim::MethodDeclaration ElementReader::methodDeclaration(const Element& element) {
    cim::MethodDeclaration result;
    result.name = element.requiredAttribute("NAME");
    result.returnType = typeOf(element, "TYPE").value_or(cim::Type::UInt32);
    result.origin = element.attribute("CLASSORIGIN");
    result.propagated = element.flag("PROPAGATED", false);
    for (const Element& child : element.children) {
        if (child.is("QUALIFIER")) {
            result.qualifiers.push_back(qualifier(child));
        } else if (child.is("PARAMETER") || child.is("PARAMETER.REFERENCE") ||
                   child.is("PARAMETER.ARRAY") || child.is("PARAMETER.REFARRAY")) {
            result.parameters.push_back(parameterDeclaration(child));
        } else {
            refuseChild(element, child);
        }
    }
    return result;
}

cim::Class ElementReader::declaration(const Element& element) {
    if (element.is("CLASS")) {
        return plainClass(element);
    }
    if (!holdsClass(element)) {
        throw NotValid("CLASS is expected instead of " + element.name);
    }
    return plainClass(element.children.back());
}

cim::Class ElementReader::plainClass(const Element& element) {
    cim::Class result;
    result.name = element.requiredAttribute("NAME");
    result.superclass = element.attribute("SUPERCLASS");
    for (const Element& child : element.children) {
        if (child.is("QUALIFIER")) {
            result.qualifiers.push_back(qualifier(child));
        } else if (child.is("METHOD")) {
            result.methods.push_back(methodDeclaration(child));
        } else if (child.is("PROPERTY") || child.is("PROPERTY.ARRAY") ||
                   child.is("PROPERTY.REFERENCE")) {
            result.properties.push_back(propertyDeclaration(child));
        } else {
            refuseChild(element, child);
        }
    }
    return result;
}

cim::QualifierType ElementReader::qualifierType(const Element& element) {
    if (!element.is("QUALIFIER.DECLARATION")) {
        throw NotValid("QUALIFIER.DECLARATION is expected instead of " + element.name);
    }
    QualifierType result;
    result.name = element.requiredAttribute("NAME");
    result.type = typeOf(element, "TYPE").value_or(cim::Type::String);
    result.array = element.flag("ISARRAY", element.find("VALUE.ARRAY") != nullptr);
    result.arraySize = arraySizeOf(element);
    result.flavor = flavorOf(element);
    result.defaultValue = cim::Value::null(result.type, result.array);
    for (const Element& child : element.children) {
        if (child.is("SCOPE")) {
            result.scopes |= scopesOf(child);
        } else if (child.is(result.array ? "VALUE.ARRAY" : "VALUE")) {
            result.defaultValue = value(child, result.type);
        } else {
            refuseChild(element, child);
        }
    }
    return result;
}

} // namespace qelo::cimxml
