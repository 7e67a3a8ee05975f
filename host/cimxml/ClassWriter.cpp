#include "Characters.h"
#include "ElementWriter.h"

#include <algorithm>

namespace qelo::cimxml {
namespace {

using cim::QualifierType;

void appendFlag(std::string& out, std::string_view name, bool value) {
    appendAttribute(out, name, value ? "true" : "false");
}

// Only what differs from the defaults of the standard.
void appendFlavor(std::string& out, const cim::QualifierFlavor& flavor) {
    if (!flavor.overridable) {
        appendFlag(out, "OVERRIDABLE", false);
    }
    if (!flavor.toSubclass) {
        appendFlag(out, "TOSUBCLASS", false);
    }
    if (flavor.translatable) {
        appendFlag(out, "TRANSLATABLE", true);
    }
}

void appendArraySize(std::string& out, const std::optional<std::uint32_t>& size) {
    if (size) {
        appendAttribute(out, "ARRAYSIZE", std::to_string(*size));
    }
}

// NAME and TYPE, or REFERENCECLASS, of a property or parameter.
void appendTyped(std::string& out, const cim::TypedElement& element) {
    appendAttribute(out, "NAME", element.name);
    if (element.type != cim::Type::Reference) {
        appendType(out, "TYPE", element.type);
    } else if (!element.referenceClass.empty()) {
        appendAttribute(out, "REFERENCECLASS", element.referenceClass);
    }
    if (element.array) {
        appendArraySize(out, element.arraySize);
    }
}

template <class Declaration>
void appendOrigin(std::string& out, const Declaration& element, const ClassOptions& options) {
    if (options.includeClassOrigin && !element.origin.empty()) {
        appendAttribute(out, "CLASSORIGIN", element.origin);
    }
    if (element.propagated) {
        appendFlag(out, "PROPAGATED", true);
    }
}

void appendWanted(std::string& out, const std::vector<cim::Qualifier>& qualifiers,
                  const ClassOptions& options) {
    if (options.includeQualifiers) {
        cimxml::appendQualifiers(out, qualifiers, options.localOnly);
    }
}

void openElement(std::string& out, std::string_view name) {
    out += '<';
    out += name;
}

void closeElement(std::string& out, std::string_view name) {
    out += "</";
    out += name;
    out += '>';
}

void appendProperty(std::string& out, const cim::PropertyDeclaration& property,
                    const ClassOptions& options) {
    const std::string_view element = property.type == cim::Type::Reference ? "PROPERTY.REFERENCE"
                                     : property.array                      ? "PROPERTY.ARRAY"
                                                                           : "PROPERTY";
    openElement(out, element);
    appendTyped(out, property);
    appendOrigin(out, property, options);
    out += '>';
    appendWanted(out, property.qualifiers, options);
    appendValue(out, property.defaultValue);
    closeElement(out, element);
}

std::string_view parameterElement(const cim::ParameterDeclaration& parameter) {
    if (parameter.type == cim::Type::Reference) {
        return parameter.array ? "PARAMETER.REFARRAY" : "PARAMETER.REFERENCE";
    }
    return parameter.array ? "PARAMETER.ARRAY" : "PARAMETER";
}

void appendMethod(std::string& out, const cim::MethodDeclaration& method,
                  const ClassOptions& options) {
    openElement(out, "METHOD");
    appendAttribute(out, "NAME", method.name);
    appendType(out, "TYPE", method.returnType);
    appendOrigin(out, method, options);
    out += '>';
    appendWanted(out, method.qualifiers, options);
    for (const auto& parameter : method.parameters) {
        const std::string_view element = parameterElement(parameter);
        openElement(out, element);
        appendTyped(out, parameter);
        out += '>';
        appendWanted(out, parameter.qualifiers, options);
        closeElement(out, element);
    }
    closeElement(out, "METHOD");
}

bool isWanted(const cim::PropertyDeclaration& property, const ClassOptions& options) {
    if (options.localOnly && property.propagated) {
        return false;
    }
    return !options.properties ||
           std::any_of(
               options.properties->begin(), options.properties->end(),
               [&](const std::string& wanted) { return cim::sameName(wanted, property.name); });
}

void appendScope(std::string& out, std::uint32_t scopes) {
    constexpr std::pair<std::string_view, std::uint32_t> kScopes[] = {
        {"CLASS", QualifierType::ScopeClass},
        {"ASSOCIATION", QualifierType::ScopeAssociation},
        {"REFERENCE", QualifierType::ScopeReference},
        {"PROPERTY", QualifierType::ScopeProperty},
        {"METHOD", QualifierType::ScopeMethod},
        {"PARAMETER", QualifierType::ScopeParameter},
        {"INDICATION", QualifierType::ScopeIndication}};
    out += "<SCOPE";
    for (const auto& [name, bit] : kScopes) {
        if ((scopes & bit) != 0) {
            appendFlag(out, name, true);
        }
    }
    out += "/>";
}

} // namespace

void appendQualifiers(std::string& out, const std::vector<cim::Qualifier>& qualifiers,
                      bool localOnly) {
    for (const cim::Qualifier& qualifier : qualifiers) {
        if (localOnly && qualifier.propagated) {
            continue;
        }
        out += "<QUALIFIER";
        appendAttribute(out, "NAME", qualifier.name);
        appendType(out, "TYPE", qualifier.value.type());
        if (qualifier.propagated) {
            appendFlag(out, "PROPAGATED", true);
        }
        appendFlavor(out, qualifier.flavor);
        out += '>';
        appendValue(out, qualifier.value);
        out += "</QUALIFIER>";
    }
}

void appendClass(std::string& out, const cim::Class& declaration, const ClassOptions& options) {
    out += "<CLASS";
    appendAttribute(out, "NAME", declaration.name);
    if (!declaration.superclass.empty()) {
        appendAttribute(out, "SUPERCLASS", declaration.superclass);
    }
    out += '>';
    appendWanted(out, declaration.qualifiers, options);
    for (const auto& property : declaration.properties) {
        if (isWanted(property, options)) {
            appendProperty(out, property, options);
        }
    }
    for (const auto& method : declaration.methods) {
        if (!options.localOnly || !method.propagated) {
            appendMethod(out, method, options);
        }
    }
    out += "</CLASS>";
}

void appendQualifierType(std::string& out, const cim::QualifierType& type) {
    out += "<QUALIFIER.DECLARATION";
    appendAttribute(out, "NAME", type.name);
    appendType(out, "TYPE", type.type);
    appendFlag(out, "ISARRAY", type.array);
    appendArraySize(out, type.arraySize);
    appendFlavor(out, type.flavor);
    out += '>';
    appendScope(out, type.scopes);
    appendValue(out, type.defaultValue);
    out += "</QUALIFIER.DECLARATION>";
}

} // namespace qelo::cimxml
