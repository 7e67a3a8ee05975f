// Operations on classes and qualifier types, answered from the class repository. It is read
// once, at start, so what would change it is not supported.
#include "OperationCall.h"

#include <iterator>

namespace qelo::server {
namespace {

constexpr unsigned int kInvalidClass = 5;
constexpr unsigned int kNotFound = 6;

cimxml::ClassOptions optionsOf(const IntrinsicParameters& parameters) {
    cimxml::ClassOptions options;
    options.localOnly = parameters.flag("LocalOnly", true);
    options.includeQualifiers = parameters.flag("IncludeQualifiers", true);
    options.includeClassOrigin = parameters.flag("IncludeClassOrigin", false);
    options.properties = parameters.propertyList();
    return options;
}

const cim::Class& requireClass(const OperationCall& call, const std::string& name,
                               unsigned int code) {
    const cim::Class* const found = call.repository().find(call.nameSpace(), name);
    if (found == nullptr) {
        throw client::CimError(code, "no such class: \"" + name + "\"");
    }
    return *found;
}

void getClass(const OperationCall& call) {
    const IntrinsicParameters parameters(
        call.request,
        {"ClassName", "LocalOnly", "IncludeQualifiers", "IncludeClassOrigin", "PropertyList"});
    const cim::Class& found =
        requireClass(call, parameters.requiredClassName("ClassName"), kNotFound);
    const cimxml::ClassOptions options = optionsOf(parameters);
    call.answerWith([&] { call.answer.writer().declaration(call.answer.text(), found, options); });
}

// The classes below the one that the request names, or all without superclass.
std::vector<const cim::Class*> classesOf(const OperationCall& call,
                                         const IntrinsicParameters& parameters) {
    std::string name = parameters.className("ClassName");
    if (!name.empty()) {
        name = requireClass(call, name, kInvalidClass).name;
    }
    return call.repository().subclasses(call.nameSpace(), name,
                                        parameters.flag("DeepInheritance", false));
}

void enumerateClasses(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"ClassName", "DeepInheritance", "LocalOnly",
                                                        "IncludeQualifiers", "IncludeClassOrigin"});
    const cimxml::ClassOptions options = optionsOf(parameters);
    const auto classes = classesOf(call, parameters);
    call.answerWith([&] {
        for (const cim::Class* const found : classes) {
            call.answer.writer().declaration(call.answer.text(), *found, options);
            call.answer.sendIfWorth();
        }
    });
}

void enumerateClassNames(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"ClassName", "DeepInheritance"});
    const auto classes = classesOf(call, parameters);
    call.answerWith([&] {
        for (const cim::Class* const found : classes) {
            call.answer.writer().className(call.answer.text(), found->name);
        }
    });
}

void getQualifier(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {"QualifierName"});
    const std::string name = parameters.requiredText("QualifierName");
    const cim::QualifierType* const found =
        call.repository().findQualifierType(call.nameSpace(), name);
    if (found == nullptr) {
        throw client::CimError(kNotFound, "no such qualifier: \"" + name + "\"");
    }
    call.answerWith([&] { call.answer.writer().qualifierType(call.answer.text(), *found); });
}

void enumerateQualifiers(const OperationCall& call) {
    const IntrinsicParameters parameters(call.request, {});
    call.answerWith([&] {
        for (const cim::QualifierType* const found :
             call.repository().qualifierTypes(call.nameSpace())) {
            call.answer.writer().qualifierType(call.answer.text(), *found);
        }
    });
}

constexpr NamedOperation kOperations[] = {
    {"GetClass", getClass},
    {"EnumerateClasses", enumerateClasses},
    {"GetQualifier", getQualifier},
    {"EnumerateClassNames", enumerateClassNames},
    {"EnumerateQualifiers", enumerateQualifiers},
};

} // namespace

OperationTable classOperations() { return {std::begin(kOperations), std::end(kOperations)}; }

} // namespace qelo::server
