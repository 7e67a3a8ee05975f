#include "ClassEquality.h"

#include <cim/ObjectPath.h>

#include <algorithm>

namespace qelo::schema {
namespace {

bool same(const cim::QualifierFlavor& left, const cim::QualifierFlavor& right) {
    return left.overridable == right.overridable && left.toSubclass == right.toSubclass &&
           left.translatable == right.translatable;
}

bool sameQualifier(const cim::Qualifier& left, const cim::Qualifier& right) {
    return cim::sameName(left.name, right.name) && left.value == right.value &&
           same(left.flavor, right.flavor);
}

template <class Item>
bool sameList(const std::vector<Item>& left, const std::vector<Item>& right,
              bool (*same)(const Item&, const Item&)) {
    return std::equal(left.begin(), left.end(), right.begin(), right.end(), same);
}

bool sameElement(const cim::TypedElement& left, const cim::TypedElement& right) {
    return cim::sameName(left.name, right.name) && left.type == right.type &&
           left.array == right.array && left.arraySize == right.arraySize &&
           cim::sameName(left.referenceClass, right.referenceClass) &&
           sameList(left.qualifiers, right.qualifiers, sameQualifier);
}

bool sameParameter(const cim::ParameterDeclaration& left, const cim::ParameterDeclaration& right) {
    return sameElement(left, right);
}

bool sameProperty(const cim::PropertyDeclaration& left, const cim::PropertyDeclaration& right) {
    return sameElement(left, right) && left.defaultValue == right.defaultValue;
}

bool sameMethod(const cim::MethodDeclaration& left, const cim::MethodDeclaration& right) {
    return cim::sameName(left.name, right.name) && left.returnType == right.returnType &&
           sameList(left.qualifiers, right.qualifiers, sameQualifier) &&
           sameList(left.parameters, right.parameters, sameParameter);
}

} // namespace

bool sameDeclaration(const cim::Class& left, const cim::Class& right) {
    return cim::sameName(left.name, right.name) &&
           cim::sameName(left.superclass, right.superclass) &&
           sameList(left.qualifiers, right.qualifiers, sameQualifier) &&
           sameList(left.properties, right.properties, sameProperty) &&
           sameList(left.methods, right.methods, sameMethod);
}

bool sameDeclaration(const cim::QualifierType& left, const cim::QualifierType& right) {
    return cim::sameName(left.name, right.name) && left.type == right.type &&
           left.array == right.array && left.arraySize == right.arraySize &&
           left.defaultValue == right.defaultValue && left.scopes == right.scopes &&
           same(left.flavor, right.flavor);
}

} // namespace qelo::schema
