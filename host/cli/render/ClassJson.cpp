#include "ClassText.h"
#include "JsonValues.h"

namespace qelo::cli {
namespace {

OrderedJson qualifiersJson(const std::vector<cim::Qualifier>& qualifiers) {
    OrderedJson object = OrderedJson::object();
    for (const cim::Qualifier& qualifier : qualifiers) {
        object[qualifier.name] = valueJson(qualifier.value);
    }
    return object;
}

OrderedJson elementJson(const cim::TypedElement& element) {
    OrderedJson object = OrderedJson::object();
    object["name"] = element.name;
    object["type"] = cim::typeName(element.type);
    object["array"] = element.array;
    if (element.arraySize) {
        object["size"] = *element.arraySize;
    }
    if (element.type == cim::Type::Reference) {
        object["class"] = element.referenceClass;
    }
    return object;
}

OrderedJson propertyJson(const cim::PropertyDeclaration& property) {
    OrderedJson object = elementJson(property);
    object["default"] = valueJson(property.defaultValue);
    object["origin"] = property.origin;
    object["qualifiers"] = qualifiersJson(property.qualifiers);
    return object;
}

OrderedJson methodJson(const cim::MethodDeclaration& method) {
    OrderedJson object = OrderedJson::object();
    object["name"] = method.name;
    object["type"] = cim::typeName(method.returnType);
    object["origin"] = method.origin;
    object["qualifiers"] = qualifiersJson(method.qualifiers);
    OrderedJson& parameters = object["parameters"] = OrderedJson::array();
    for (const cim::ParameterDeclaration& parameter : method.parameters) {
        OrderedJson item = elementJson(parameter);
        item["qualifiers"] = qualifiersJson(parameter.qualifiers);
        parameters.push_back(std::move(item));
    }
    return object;
}

} // namespace

std::string classJson(const cim::Class& known) {
    OrderedJson object = OrderedJson::object();
    object["class"] = known.name;
    object["superclass"] =
        known.superclass.empty() ? OrderedJson(nullptr) : OrderedJson(known.superclass);
    object["qualifiers"] = qualifiersJson(known.qualifiers);
    OrderedJson& properties = object["properties"] = OrderedJson::array();
    for (const cim::PropertyDeclaration& property : known.properties) {
        properties.push_back(propertyJson(property));
    }
    OrderedJson& methods = object["methods"] = OrderedJson::array();
    for (const cim::MethodDeclaration& method : known.methods) {
        methods.push_back(methodJson(method));
    }
    return dumped(object) + "\n";
}

std::string classNamesJson(const std::vector<std::string>& names) {
    return dumped(OrderedJson(names)) + "\n";
}

} // namespace qelo::cli
