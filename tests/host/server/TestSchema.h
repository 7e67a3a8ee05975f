// The classes that the tests of the server are about.
#pragma once

#include <schema/ClassRepository.h>

#include <memory>
#include <utility>

namespace qelo::server {

inline cim::PropertyDeclaration property(const char* name, cim::Type type, bool key = false) {
    cim::PropertyDeclaration result;
    result.name = name;
    result.type = type;
    result.defaultValue = cim::Value::null(type);
    if (key) {
        result.qualifiers.push_back({"Key", cim::Value::boolean(true), {}, false});
    }
    return result;
}

// TEST_Base with Id, and TEST_Thing below it with Text and Size and the method Weigh.
inline std::shared_ptr<const schema::ClassRepository> testSchema() {
    auto repository = std::make_shared<schema::ClassRepository>();
    repository->addNameSpace("root/test");
    cim::QualifierType key;
    key.name = "Key";
    key.scopes = cim::QualifierType::ScopeProperty | cim::QualifierType::ScopeReference;
    key.defaultValue = cim::Value::boolean(false);
    repository->add("root/test", key);
    cim::Class base;
    base.name = "TEST_Base";
    base.properties = {property("Id", cim::Type::String, true)};
    repository->add("root/test", base);
    cim::Class thing;
    thing.name = "TEST_Thing";
    thing.superclass = "TEST_Base";
    thing.properties = {property("Text", cim::Type::String), property("Size", cim::Type::UInt16)};
    cim::MethodDeclaration weigh;
    weigh.name = "Weigh";
    cim::ParameterDeclaration grams;
    grams.name = "Grams";
    grams.type = cim::Type::UInt32;
    weigh.parameters = {grams};
    thing.methods = {weigh};
    repository->add("root/test", thing);
    return repository;
}

} // namespace qelo::server
