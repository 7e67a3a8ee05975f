// Operations on instances and their properties.
#include "OperationCall.h"

#include <schema/Declared.h>

#include <algorithm>
#include <iterator>
#include <optional>
#include <unordered_map>

namespace qelo::server {
namespace {

using cimxml::InstanceForm;
using cimxml::PathForm;

constexpr unsigned int kInvalidClass = 5;
constexpr unsigned int kInvalidQuery = 15;

cim::ObjectPath declaredPath(const OperationCall& call, const cim::ObjectPath& path) {
    return schema::withDeclaredKeys(call.repository(), path);
}

// The properties of a class that a client wants: those it names, as far as the class that it
// asked for has them, when it does not want those of subclasses.
client::PropertyList propertiesOf(const OperationCall& call, const IntrinsicParameters& parameters,
                                  const std::string& className) {
    client::PropertyList wanted = parameters.propertyList();
    const cim::Class* const known = call.repository().find(call.nameSpace(), className);
    if (parameters.flag("DeepInheritance", true) || known == nullptr) {
        return wanted;
    }
    if (!wanted) {
        wanted.emplace();
        for (const cim::PropertyDeclaration& property : known->properties) {
            wanted->push_back(property.name);
        }
        return wanted;
    }
    wanted->erase(std::remove_if(wanted->begin(), wanted->end(),
                                 [&](const auto& name) { return !known->property(name); }),
                  wanted->end());
    return wanted;
}

void requireClass(const OperationCall& call, const std::string& className) {
    if (call.repository().find(call.nameSpace(), className) == nullptr) {
        throw client::CimError(kInvalidClass, "no such class: \"" + className + "\"");
    }
}

void enumerateInstanceNames(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"ClassName"});
    const std::string className = parameters.requiredClassName("ClassName");
    call.answerWith([&] {
        call.router().enumerateInstanceNames(
            call.context, call.classPath(className),
            [&](const cim::ObjectPath& path) { call.answerPath(path, PathForm::InstanceName); });
    });
}

void enumerateInstances(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"ClassName", "LocalOnly", "DeepInheritance",
                                                        "IncludeQualifiers", "IncludeClassOrigin",
                                                        "PropertyList"});
    const std::string className = parameters.requiredClassName("ClassName");
    InstanceWriting writing(call, parameters);
    const client::PropertyList properties = propertiesOf(call, parameters, className);
    call.answerWith([&] {
        call.router().enumerateInstances(
            call.context, call.classPath(className), properties,
            [&](const cim::Instance& instance) { writing.write(instance, InstanceForm::Named); });
    });
}

void getInstance(const OperationCall& call) {
    const IntrinsicParameters parameters(
        call.request,
        {"InstanceName", "LocalOnly", "IncludeQualifiers", "IncludeClassOrigin", "PropertyList"});
    const cim::ObjectPath path =
        declaredPath(call, parameters.requiredInstanceName("InstanceName"));
    InstanceWriting writing(call, parameters);
    const cim::Instance found =
        call.router().getInstance(call.context, path, parameters.propertyList());
    call.answerWith([&] { writing.write(found, InstanceForm::Plain); });
}

void createInstance(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"NewInstance"});
    call.requirePermission();
    const cim::Instance instance = parameters.requiredInstance("NewInstance");
    requireClass(call, instance.className());
    const cim::ObjectPath made =
        call.router().createInstance(call.context, call.classPath(instance.className()), instance);
    call.answerWith([&] { call.answerPath(made, PathForm::InstanceName); });
}

void modifyInstance(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request,
                                         {"ModifiedInstance", "IncludeQualifiers", "PropertyList"});
    call.requirePermission();
    const cim::Instance instance = parameters.requiredInstance("ModifiedInstance");
    call.router().modifyInstance(call.context, declaredPath(call, instance.path()), instance,
                                 parameters.propertyList());
    call.answerWithNothing();
}

void deleteInstance(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"InstanceName"});
    call.requirePermission();
    call.router().deleteInstance(
        call.context, declaredPath(call, parameters.requiredInstanceName("InstanceName")));
    call.answerWithNothing();
}

void getProperty(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"InstanceName", "PropertyName"});
    const cim::Value value = call.router().getProperty(
        call.context, declaredPath(call, parameters.requiredInstanceName("InstanceName")),
        parameters.requiredText("PropertyName"));
    call.answerWith([&] { call.answer.writer().value(call.answer.text(), value); });
}

void setProperty(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request,
                                         {"InstanceName", "PropertyName", "NewValue"});
    call.requirePermission();
    call.router().setProperty(
        call.context, declaredPath(call, parameters.requiredInstanceName("InstanceName")),
        parameters.requiredText("PropertyName"), parameters.rawValue("NewValue"));
    call.answerWithNothing();
}

bool isBlank(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; }

// The class behind FROM, which is all that finding the provider takes.
std::string classOfQuery(const std::string& query) {
    std::string word;
    bool afterFrom = false;
    for (std::size_t i = 0; i <= query.size(); ++i) {
        if (i < query.size() && !isBlank(query[i])) {
            word += query[i];
            continue;
        }
        if (afterFrom && !word.empty()) {
            return word;
        }
        afterFrom = cim::sameName(word, "FROM") || (afterFrom && word.empty());
        word.clear();
    }
    throw client::CimError(kInvalidQuery, "the query has no FROM");
}

void execQuery(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"QueryLanguage", "Query"});
    const std::string language = parameters.requiredText("QueryLanguage");
    const std::string query = parameters.requiredText("Query");
    const cim::ObjectPath classPath = call.classPath(classOfQuery(query));
    InstanceWriting writing(call, parameters);
    call.answerWith([&] {
        call.router().execQuery(call.context, classPath, query, language,
                                [&](const cim::Instance& instance) {
                                    writing.write(instance, InstanceForm::WithObjectPath);
                                });
    });
}

constexpr NamedOperation kOperations[] = {
    {"EnumerateInstanceNames", enumerateInstanceNames},
    {"EnumerateInstances", enumerateInstances},
    {"GetInstance", getInstance},
    {"CreateInstance", createInstance},
    {"ModifyInstance", modifyInstance},
    {"DeleteInstance", deleteInstance},
    {"GetProperty", getProperty},
    {"SetProperty", setProperty},
    {"ExecQuery", execQuery},
};

} // namespace

OperationTable instanceOperations() { return {std::begin(kOperations), std::end(kOperations)}; }

void callMethod(const OperationCall& call) {
    call.requirePermission();
    const cim::ObjectPath path = declaredPath(call, call.request.target);
    std::vector<schema::UntypedArgument> given;
    for (const cimxml::ExtrinsicParameter& parameter : call.request.extrinsicParameters) {
        given.push_back({parameter.name, parameter.value, parameter.typed});
    }
    const schema::DeclaredCall declared = schema::declaredCall(
        call.repository(), call.nameSpace(), path.className(), call.request.method, given);
    const client::MethodResult result =
        call.router().invokeMethod(call.context, path, declared.method, declared.arguments);
    call.answer.writer().methodResult(call.answer.text(), result);
    call.answer.send();
}

} // namespace qelo::server
