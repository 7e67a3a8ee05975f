// Operations that follow associations.
#include "OperationCall.h"

#include <schema/Declared.h>

#include <iterator>

namespace qelo::server {
namespace {

using cimxml::InstanceForm;
using cimxml::PathForm;

constexpr unsigned int kInvalidParameter = 4;
constexpr unsigned int kNotSupported = 7;

// The object to start from. The operations on classes, which answer classes, are not offered.
cim::ObjectPath sourceOf(const OperationCall& call, const IntrinsicParameters& parameters) {
    for (const cimxml::IntrinsicParameter& given : call.request.intrinsicParameters) {
        if (std::holds_alternative<cimxml::ClassName>(given.value) &&
            cim::sameName(given.name, "ObjectName")) {
            throw client::CimError(kNotSupported, "associations of classes are not supported");
        }
    }
    cim::ObjectPath path =
        schema::withDeclaredKeys(call.repository(), parameters.requiredInstanceName("ObjectName"));
    if (call.repository().find(call.nameSpace(), path.className()) == nullptr) {
        throw client::CimError(kInvalidParameter, "no such class: \"" + path.className() + "\"");
    }
    return path;
}

client::AssociationFilter filterOf(const IntrinsicParameters& parameters) {
    return {parameters.className("AssocClass"), parameters.className("ResultClass"),
            parameters.text("Role"), parameters.text("ResultRole")};
}

constexpr std::initializer_list<const char*> kFarNames = {"ObjectName", "AssocClass", "ResultClass",
                                                          "Role", "ResultRole"};
constexpr std::initializer_list<const char*> kFarInstances = {
    "ObjectName", "AssocClass",        "ResultClass",        "Role",
    "ResultRole", "IncludeQualifiers", "IncludeClassOrigin", "PropertyList"};
constexpr std::initializer_list<const char*> kNearNames = {"ObjectName", "ResultClass", "Role"};
constexpr std::initializer_list<const char*> kNearInstances = {
    "ObjectName", "ResultClass", "Role", "IncludeQualifiers", "IncludeClassOrigin", "PropertyList"};

using NamesFunction = void (broker::Router::*)(const broker::OperationContext&,
                                               const cim::ObjectPath&,
                                               const client::AssociationFilter&,
                                               const client::PathSink&);
using InstancesFunction = void (broker::Router::*)(const broker::OperationContext&,
                                                   const cim::ObjectPath&,
                                                   const client::AssociationFilter&,
                                                   const client::PropertyList&,
                                                   const client::InstanceSink&);

void answerPaths(const OperationCall& call, std::initializer_list<const char*> known,
                 NamesFunction function) {
    const IntrinsicParameters parameters(call.request, known);
    const cim::ObjectPath source = sourceOf(call, parameters);
    const client::AssociationFilter filter = filterOf(parameters);
    call.answerWith([&] {
        (call.router().*function)(call.context, source, filter, [&](const cim::ObjectPath& path) {
            call.answerPath(path, PathForm::ObjectPath);
        });
    });
}

void answerInstances(const OperationCall& call, std::initializer_list<const char*> known,
                     InstancesFunction function) {
    const IntrinsicParameters parameters(call.request, known);
    const cim::ObjectPath source = sourceOf(call, parameters);
    const client::AssociationFilter filter = filterOf(parameters);
    InstanceWriting writing(call, parameters);
    call.answerWith([&] {
        (call.router().*function)(call.context, source, filter, parameters.propertyList(),
                                  [&](const cim::Instance& instance) {
                                      writing.write(instance, InstanceForm::WithObjectPath);
                                  });
    });
}

void associators(const OperationCall& call) {
    answerInstances(call, kFarInstances, &broker::Router::associators);
}

void associatorNames(const OperationCall& call) {
    answerPaths(call, kFarNames, &broker::Router::associatorNames);
}

void references(const OperationCall& call) {
    answerInstances(call, kNearInstances, &broker::Router::references);
}

void referenceNames(const OperationCall& call) {
    answerPaths(call, kNearNames, &broker::Router::referenceNames);
}

constexpr NamedOperation kOperations[] = {
    {"Associators", associators},
    {"AssociatorNames", associatorNames},
    {"References", references},
    {"ReferenceNames", referenceNames},
};

} // namespace

OperationTable associationOperations() { return {std::begin(kOperations), std::end(kOperations)}; }

} // namespace qelo::server
