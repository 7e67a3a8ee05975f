// One of everything, for round trips.
#pragma once

#include <cim/Class.h>
#include <cim/Instance.h>

#include <cmath>

namespace qelo::cimxml {

inline const std::string kAwkwardText =
    " <a>&amp;\"'\t\n\r]]> \xC3\xA4 \xE2\x82\xAC \xF0\x9F\x98\x80 ";

inline cim::ObjectPath samplePath(const std::string& nameSpace = "root/cimv2") {
    using cim::Type;
    using cim::Value;
    cim::ObjectPath end("root/other", "D");
    end.setKey("N", Value::string("x"));
    cim::ObjectPath path(nameSpace, "C");
    path.setKey("Name", Value::string(kAwkwardText));
    path.setKey("Number", Value::unsignedInteger(Type::UInt16, 5));
    path.setKey("Below", Value::signedInteger(Type::SInt8, -5));
    path.setKey("Flag", Value::boolean(true));
    path.setKey("Real", Value::real(Type::Real32, static_cast<double>(0.1F)));
    path.setKey("Letter", Value::unsignedInteger(Type::Char16, 0xE4));
    path.setKey("When", Value::dateTime(*cim::DateTime::parse("20261121053000.000000+060")));
    path.setKey("End", Value::reference(std::move(end)));
    return path;
}

inline cim::Instance sampleInstance(cim::ObjectPath path = samplePath()) {
    using cim::Type;
    using cim::Value;
    cim::Instance inner(cim::ObjectPath("", "Inner"));
    inner.setProperty("Text", Value::string(kAwkwardText));
    cim::Instance middle(cim::ObjectPath("", "Middle"));
    middle.setProperty("Inner", Value::instance(inner));
    cim::ObjectPath classReference("root/cimv2", "K");
    cim::ObjectPath farReference = samplePath();
    farReference.setHost("h");

    cim::Instance instance(std::move(path));
    instance.setProperty("Text", Value::string(kAwkwardText));
    instance.setProperty("Empty", Value::string(""));
    instance.setProperty("NoText", Value::null(Type::String));
    instance.setProperty("Flag", Value::boolean(false));
    instance.setProperty("Letter", Value::unsignedInteger(Type::Char16, '<'));
    instance.setProperty("U8", Value::unsignedInteger(Type::UInt8, 255));
    instance.setProperty("U64", Value::unsignedInteger(Type::UInt64, UINT64_MAX));
    instance.setProperty("S64", Value::signedInteger(Type::SInt64, INT64_MIN));
    instance.setProperty("R32", Value::real(Type::Real32, static_cast<double>(0.1F)));
    instance.setProperty("R64", Value::real(Type::Real64, 1e300));
    instance.setProperty("Infinite", Value::real(Type::Real64, -HUGE_VAL));
    instance.setProperty("When",
                         Value::dateTime(*cim::DateTime::parse("00000001000000.000000:000")));
    instance.setProperty("Inner", Value::instance(middle));
    instance.setProperty("NoInner", Value::null(Type::Instance));
    instance.setProperty("Inners", Value::array(Type::Instance, {Value::instance(inner),
                                                                 Value::null(Type::Instance)}));
    instance.setProperty("List", Value::array(Type::String, {Value::string(""), Value::string("b"),
                                                             Value::null(Type::String)}));
    instance.setProperty("NoList", Value::null(Type::UInt32, true));
    instance.setProperty("EmptyList", Value::array(Type::UInt32, {}));
    instance.setProperty("Reference", Value::reference(samplePath("")));
    instance.setProperty("Far", Value::reference(farReference));
    instance.setProperty("Class", Value::reference(classReference));
    instance.setProperty("NoReference", Value::null(Type::Reference));
    instance.setProperty("References",
                         Value::array(Type::Reference, {Value::reference(classReference)}));
    return instance;
}

inline cim::Class sampleClass() {
    using cim::Type;
    using cim::Value;
    const cim::Qualifier key = {"Key", Value::boolean(true), {false, true, false}, true};
    const cim::Qualifier text = {
        "Description", Value::string(kAwkwardText), {true, true, true}, false};
    const cim::Qualifier list = {
        "ValueMap", Value::array(Type::String, {Value::string("1")}), {true, false, false}, false};
    cim::Class result;
    result.name = "C";
    result.superclass = "B";
    result.qualifiers = {text};
    cim::PropertyDeclaration name;
    name.name = "Name";
    name.qualifiers = {key, text};
    name.origin = "B";
    name.propagated = true;
    cim::PropertyDeclaration numbers;
    numbers.name = "Numbers";
    numbers.type = Type::UInt16;
    numbers.array = true;
    numbers.arraySize = 4;
    numbers.qualifiers = {list};
    numbers.defaultValue = Value::array(Type::UInt16, {Value::unsignedInteger(Type::UInt16, 7)});
    numbers.origin = "C";
    cim::PropertyDeclaration end;
    end.name = "End";
    end.type = Type::Reference;
    end.referenceClass = "D";
    end.defaultValue = Value::null(Type::Reference);
    end.origin = "C";
    result.properties = {name, numbers, end};
    cim::MethodDeclaration method;
    method.name = "Do";
    method.returnType = Type::SInt32;
    method.origin = "C";
    method.qualifiers = {text};
    cim::ParameterDeclaration plain;
    plain.name = "Plain";
    plain.type = Type::DateTime;
    plain.qualifiers = {list};
    cim::ParameterDeclaration array;
    array.name = "Array";
    array.type = Type::Boolean;
    array.array = true;
    cim::ParameterDeclaration reference = array;
    reference.name = "References";
    reference.type = Type::Reference;
    reference.referenceClass = "D";
    method.parameters = {plain, array, reference};
    reference.name = "Reference";
    reference.array = false;
    method.parameters.push_back(reference);
    cim::MethodDeclaration inherited;
    inherited.name = "Inherited";
    inherited.propagated = true;
    inherited.origin = "B";
    result.methods = {method, inherited};
    return result;
}

inline cim::QualifierType sampleQualifierType() {
    using cim::QualifierType;
    QualifierType type;
    type.name = "ValueMap";
    type.type = cim::Type::String;
    type.array = true;
    type.arraySize = 3;
    type.defaultValue = cim::Value::array(cim::Type::String, {cim::Value::string("x")});
    type.scopes = QualifierType::ScopeProperty | QualifierType::ScopeIndication;
    type.flavor = {false, false, true};
    return type;
}

} // namespace qelo::cimxml
