#include "ClassText.h"

#include "Display.h"
#include "Mof.h"

namespace qelo::cli {
namespace {

std::string qualifierMof(const cim::Qualifier& qualifier) {
    std::string text = displayText(qualifier.name);
    const cim::Value& value = qualifier.value;
    const bool flag = value.type() == cim::Type::Boolean && !value.isNull() && !value.isArray();
    if (flag && value.asBoolean()) {
        return text;
    }
    return value.isArray() && !value.isNull() ? text + " " + mofValue(value)
                                              : text + " (" + mofValue(value) + ")";
}

// A list in brackets, one qualifier a line; nothing when there is none.
std::string qualifiersMof(const std::vector<cim::Qualifier>& qualifiers,
                          const std::string& indent) {
    std::string text;
    for (const cim::Qualifier& qualifier : qualifiers) {
        text += (text.empty() ? indent + "[" : ",\n" + indent + " ") + qualifierMof(qualifier);
    }
    return text.empty() ? text : text + "]\n";
}

std::string typeMof(const cim::TypedElement& element) {
    return element.type == cim::Type::Reference ? displayText(element.referenceClass) + " REF"
                                                : cim::typeName(element.type);
}

std::string bracketsMof(const cim::TypedElement& element) {
    if (!element.array) {
        return "";
    }
    return "[" + (element.arraySize ? std::to_string(*element.arraySize) : "") + "]";
}

std::string elementMof(const cim::TypedElement& element) {
    return typeMof(element) + " " + displayText(element.name) + bracketsMof(element);
}

std::string originMof(const std::string& origin, bool propagated, const std::string& indent) {
    return propagated ? indent + "// from " + displayText(origin) + "\n" : "";
}

std::string propertyMof(const cim::PropertyDeclaration& property) {
    const std::string indent = "    ";
    std::string text = originMof(property.origin, property.propagated, indent) +
                       qualifiersMof(property.qualifiers, indent) + indent + elementMof(property);
    if (!property.defaultValue.isNull()) {
        text += " = " + mofValue(property.defaultValue);
    }
    return text + ";\n";
}

std::string methodMof(const cim::MethodDeclaration& method) {
    const std::string indent = "    ";
    std::string text = originMof(method.origin, method.propagated, indent) +
                       qualifiersMof(method.qualifiers, indent) + indent +
                       cim::typeName(method.returnType) + " " + displayText(method.name) + "(";
    const std::string deeper = indent + indent;
    const char* separator = "\n";
    for (const cim::ParameterDeclaration& parameter : method.parameters) {
        text += separator + qualifiersMof(parameter.qualifiers, deeper) + deeper +
                elementMof(parameter);
        separator = ",\n";
    }
    return text + ");\n";
}

} // namespace

std::string classMof(const cim::Class& known) {
    std::string text = qualifiersMof(known.qualifiers, "") + "class " + displayText(known.name);
    if (!known.superclass.empty()) {
        text += " : " + displayText(known.superclass);
    }
    text += " {\n";
    const char* separator = "";
    for (const cim::PropertyDeclaration& property : known.properties) {
        text += separator + propertyMof(property);
        separator = "\n";
    }
    for (const cim::MethodDeclaration& method : known.methods) {
        text += separator + methodMof(method);
        separator = "\n";
    }
    return text + "};\n";
}

} // namespace qelo::cli
