// Classes with their properties, references and methods.
#include "MofParser.h"

#include <cim/ValueParser.h>

#include <utility>

namespace qelo::schema {
namespace {

using Scope = cim::QualifierType::Scope;

constexpr std::size_t kMostFeatures = 4096;
constexpr std::size_t kMostParameters = 256;
constexpr std::uint32_t kAnyClass =
    Scope::ScopeClass | Scope::ScopeAssociation | Scope::ScopeIndication;

} // namespace

void MofParser::classDeclaration(const std::vector<WrittenQualifier>& written) {
    tokens_.expectKeyword("class");
    const Position position = tokens_.peek().position;
    cim::Class declared;
    declared.name = tokens_.expectName("the name of a class");
    declared.qualifiers = qualifiers(written, kAnyClass);
    if (tokens_.skipKeyword("as") && tokens_.take().kind != TokenKind::Alias) {
        tokens_.fail(position, "an alias ($name) is expected behind \"as\"");
    }
    if (tokens_.skipSymbol(':')) {
        declared.superclass = tokens_.expectName("the name of a class");
    }
    tokens_.expectSymbol('{');
    while (!tokens_.skipSymbol('}')) {
        feature(declared);
        if (declared.properties.size() + declared.methods.size() > kMostFeatures) {
            tokens_.failHere("too many properties and methods");
        }
    }
    tokens_.expectSymbol(';');
    at(position,
       [&] { compilation_.repository().add(compilation_.nameSpace(), std::move(declared)); });
}

bool MofParser::elementType(cim::TypedElement& element) {
    const Position position = tokens_.peek().position;
    const std::string type = tokens_.expectName("a type");
    if (tokens_.skipKeyword("ref")) {
        element.type = cim::Type::Reference;
        element.referenceClass = type;
        return true;
    }
    const auto known = cim::typeOfName(type);
    if (!known) {
        tokens_.fail(position, "no such type: " + type);
    }
    element.type = *known;
    return false;
}

void MofParser::feature(cim::Class& declared) {
    const std::vector<WrittenQualifier> written = qualifierList();
    cim::PropertyDeclaration element;
    const bool reference = elementType(element);
    element.name = tokens_.expectName("the name of a property or method");
    if (tokens_.atSymbol('(') && !reference) {
        element.qualifiers = qualifiers(written, Scope::ScopeMethod);
        method(element, declared);
        return;
    }
    element.qualifiers =
        qualifiers(written, reference ? Scope::ScopeReference : Scope::ScopeProperty);
    property(std::move(element), declared);
}

void MofParser::property(cim::PropertyDeclaration property, cim::Class& declared) {
    property.array = tokens_.skipArrayBrackets(property.arraySize);
    property.defaultValue = cim::Value::null(property.type, property.array);
    if (tokens_.skipSymbol('=')) {
        property.defaultValue = typed(tokens_.initializer(), property);
    }
    tokens_.expectSymbol(';');
    declared.properties.push_back(std::move(property));
}

cim::ParameterDeclaration MofParser::parameter() {
    const std::vector<WrittenQualifier> written = qualifierList();
    cim::ParameterDeclaration parameter;
    elementType(parameter);
    parameter.qualifiers = qualifiers(written, Scope::ScopeParameter);
    parameter.name = tokens_.expectName("the name of a parameter");
    parameter.array = tokens_.skipArrayBrackets(parameter.arraySize);
    return parameter;
}

void MofParser::method(const cim::TypedElement& head, cim::Class& declared) {
    cim::MethodDeclaration method;
    method.name = head.name;
    method.returnType = head.type;
    method.qualifiers = head.qualifiers;
    tokens_.expectSymbol('(');
    if (!tokens_.atSymbol(')')) {
        do {
            method.parameters.push_back(parameter());
            if (method.parameters.size() > kMostParameters) {
                tokens_.failHere("too many parameters");
            }
        } while (tokens_.skipSymbol(','));
    }
    tokens_.expectSymbol(')');
    tokens_.expectSymbol(';');
    declared.methods.push_back(std::move(method));
}

} // namespace qelo::schema
