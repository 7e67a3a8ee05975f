#include "MixedOperations.h"

#include <utility>

namespace qelo::test {

namespace {

using broker::OperationContext;
using broker::Router;
using cim::Instance;
using cim::ObjectPath;
using cim::Value;

constexpr const char* kNameSpace = "root/cimv2";
constexpr const char* kAccount = "ZANTH_Account";
constexpr const char* kGroup = "ZANTH_Group";
constexpr const char* kIdentity = "ZANTH_SimIdentity";
constexpr const char* kService = "ZANTH_AccountManagementService";
constexpr const char* kCapabilities = "ZANTH_AccountManagementCapabilities";
constexpr const char* kHosted = "ZANTH_AccountHostedService";
constexpr const char* kElement = "ZANTH_SimElementCapabilities";
constexpr const char* kSystem = "ZANTH_ComputerSystem";
constexpr const char* kNobody = "nobody-here";

ObjectPath pathOf(const std::string& className) { return {kNameSpace, className}; }

ObjectPath keyed(const std::string& className, const std::string& key, Value value) {
    ObjectPath path = pathOf(className);
    path.setKey(key, std::move(value));
    return path;
}

ObjectPath named(const std::string& className, const std::string& name) {
    return keyed(className, "Name", Value::string(name));
}

std::string textOf(const Instance& instance) {
    std::string text = instance.path().toText();
    for (const Instance::Property& property : instance.properties()) {
        text +=
            ";" + property.name + (property.value.isNull() ? "!" : "=") + property.value.toText();
    }
    return text;
}

// The two ends of an association.
struct Ends {
    const char* far;
    const char* near;
};

Ends endsOf(const std::string& className) {
    return className == kHosted ? Ends{"Antecedent", "Dependent"}
                                : Ends{"ManagedElement", "Capabilities"};
}

std::string textOf(const Value* end) { return end == nullptr ? "none" : end->toText(); }

std::string pairOf(const ObjectPath& path, const Ends& ends) {
    return textOf(path.key(ends.far)) + kBetweenEnds + textOf(path.key(ends.near));
}

std::string pairOf(const Instance& instance, const Ends& ends) {
    return textOf(instance.property(ends.far)) + kBetweenEnds +
           textOf(instance.property(ends.near));
}

// Runs a request that adds its results to the answer.
template <class Request> Answer answerOf(Request request) {
    Answer answer;
    try {
        request(answer.results);
    } catch (const client::CimError& error) {
        answer.status = error.code();
    }
    return answer;
}

using Results = std::vector<std::string>;

auto pathsInto(Results& results) {
    return [&results](const ObjectPath& path) { results.push_back(path.toText()); };
}

auto instancesInto(Results& results) {
    return [&results](const Instance& instance) { results.push_back(textOf(instance)); };
}

auto pathPairsInto(Results& results, Ends ends) {
    return [&results, ends](const ObjectPath& path) { results.push_back(pairOf(path, ends)); };
}

auto pairsInto(Results& results, Ends ends) {
    return
        [&results, ends](const Instance& instance) { results.push_back(pairOf(instance, ends)); };
}

const OperationContext& nobody() {
    static const OperationContext context;
    return context;
}

class Catalogue {
public:
    Catalogue(Router& router, Subjects subjects) : subjects_(std::move(subjects)) {
        router.enumerateInstanceNames(nobody(), pathOf(kSystem),
                                      [this](const ObjectPath& path) { system_ = path; });
    }

    std::vector<Operation> all() {
        addClass(kAccount, {named(kAccount, subjects_.account),
                            named(kAccount, subjects_.accountOfOne), named(kAccount, kNobody)});
        addClass(kGroup, {named(kGroup, subjects_.group), named(kGroup, subjects_.groupOfOne),
                          named(kGroup, kNobody)});
        addClass(kIdentity, {keyed(kIdentity, "InstanceID", Value::string("ZANTH:SimIdentity1"))});
        addClass(kService, {service(subjects_.service), service(subjects_.serviceOfOne)});
        addClass(kCapabilities,
                 {capabilities(subjects_.service), capabilities(subjects_.serviceOfOne)});
        addClass(kSystem, {system_, named(kSystem, "elsewhere")});
        addAssociation(kHosted, system_, service(subjects_.service));
        addAssociation(kElement, service(subjects_.service), capabilities(subjects_.service));
        addAccountMethods();
        addGroupMethods();
        return std::move(operations_);
    }

private:
    static ObjectPath service(const std::string& node) {
        ObjectPath path = named(kService, "SimAccountManagementService_" + node);
        path.setKey("CreationClassName", Value::string(kService));
        return path;
    }

    static ObjectPath capabilities(const std::string& node) {
        return keyed(kCapabilities, "InstanceID",
                     Value::string("SimAccountManagementCapabilities_" + node));
    }

    template <class Request>
    Operation& add(const std::string& kind, const std::string& className,
                   const std::string& variant, Request request) {
        operations_.push_back({kind, className, variant, false, [request](Router& router) {
                                   return answerOf(
                                       [&](Results& results) { request(router, results); });
                               }});
        return operations_.back();
    }

    void addClass(const std::string& className, const std::vector<ObjectPath>& instances) {
        add("EnumInstanceNames", className, "", [=](Router& router, Results& results) {
            router.enumerateInstanceNames(nobody(), pathOf(className), pathsInto(results));
        });
        for (const auto& properties : propertyLists()) {
            add("EnumInstances", className, properties ? "in part" : "",
                [=](Router& router, Results& results) {
                    router.enumerateInstances(nobody(), pathOf(className), properties,
                                              instancesInto(results));
                });
        }
        addInstances(className, instances);
    }

    static std::vector<client::PropertyList> propertyLists() {
        return {std::nullopt, std::vector<std::string>{"Name", "Description", "ElementName"}};
    }

    void addInstances(const std::string& className, const std::vector<ObjectPath>& instances) {
        for (const ObjectPath& path : instances) {
            const std::string variant = path.toText();
            add("GetInstance", className, variant, [=](Router& router, Results& results) {
                results.push_back(textOf(router.getInstance(nobody(), path, std::nullopt)));
            });
        }
        addRefused(className, instances.front());
    }

    // The providers only read.
    void addRefused(const std::string& className, const ObjectPath& path) {
        Instance instance(path);
        instance.setProperty("ElementName", Value::string("text"));
        add("CreateInstance", className, "", [=](Router& router, Results& results) {
            results.push_back(
                router.createInstance(nobody(), pathOf(className), instance).toText());
        });
        add("ModifyInstance", className, "", [=](Router& router, Results&) {
            router.modifyInstance(nobody(), path, instance, std::nullopt);
        });
        add("DeleteInstance", className, "",
            [=](Router& router, Results&) { router.deleteInstance(nobody(), path); });
        add("ExecQuery", className, "", [=](Router& router, Results& results) {
            router.execQuery(nobody(), pathOf(className), "select * from " + className, "WQL",
                             instancesInto(results));
        });
    }

    void addAssociation(const std::string& className, const ObjectPath& far,
                        const ObjectPath& near) {
        const Ends ends = endsOf(className);
        add("EnumInstanceNames", className, "", [=](Router& router, Results& results) {
            router.enumerateInstanceNames(nobody(), pathOf(className),
                                          pathPairsInto(results, ends));
        }).pairs = true;
        add("EnumInstances", className, "", [=](Router& router, Results& results) {
            router.enumerateInstances(nobody(), pathOf(className), std::nullopt,
                                      pairsInto(results, ends));
        }).pairs = true;
        ObjectPath own = keyed(className, ends.far, Value::reference(far));
        own.setKey(ends.near, Value::reference(near));
        add("GetInstance", className, "", [=](Router& router, Results& results) {
            results.push_back(pairOf(router.getInstance(nobody(), own, std::nullopt), ends));
        }).pairs = true;
        addRefused(className, own);
        for (const ObjectPath& source : {far, near}) {
            addTraversals(className, source, ends);
        }
    }

    void addTraversals(const std::string& className, const ObjectPath& source, Ends ends) {
        const std::string from = "from " + source.className();
        const client::AssociationFilter along{className, "", "", ""};
        add("Associators", className, from, [=](Router& router, Results& results) {
            router.associators(nobody(), source, along, std::nullopt, instancesInto(results));
        });
        for (const client::AssociationFilter& filter : {along, client::AssociationFilter{}}) {
            add("AssociatorNames", className,
                from + (filter.assocClass.empty() ? " along any" : ""),
                [=](Router& router, Results& results) {
                    router.associatorNames(nobody(), source, filter, pathsInto(results));
                });
        }
        const client::AssociationFilter own{"", className, "", ""};
        add("References", className, from, [=](Router& router, Results& results) {
            router.references(nobody(), source, own, std::nullopt, pairsInto(results, ends));
        }).pairs = true;
        add("ReferenceNames", className, from, [=](Router& router, Results& results) {
            router.referenceNames(nobody(), source, own, pathPairsInto(results, ends));
        }).pairs = true;
    }

    void addMethod(const std::string& className, const std::string& method,
                   const client::Arguments& arguments) {
        add("InvokeMethod " + method, className, "refused", [=](Router& router, Results&) {
            router.invokeMethod(nobody(), pathOf(className), method, arguments);
        });
    }

    void addAccountMethods() {
        const auto there = textArgument("Name", subjects_.account);
        const auto missing = textArgument("Name", kNobody);
        addMethod(kAccount, "CreateUser", {there, textArgument("FullName", "Some Body")});
        addMethod(kAccount, "ModifyUser", {missing, numberArgument("daysExpireAfter", 5)});
        addMethod(kAccount, "DeleteUser", {missing});
        addMethod(kAccount, "SetPassword", {missing, textArgument("UserPassword", "secret")});
        addMethod(kAccount, "EnableUser", {missing});
        addMethod(kAccount, "DisableUser", {missing});
    }

    void addGroupMethods() {
        const auto there = textArgument("Name", subjects_.group);
        const auto missing = textArgument("Name", kNobody);
        addMethod(kGroup, "CreateGroup", {there});
        addMethod(kGroup, "DeleteGroup", {missing});
        addMethod(kGroup, "AddMember", {there, textArgument("Member", kNobody)});
        addMethod(kGroup, "RemoveMember", {there, textArgument("Member", kNobody)});
    }

    Subjects subjects_;
    ObjectPath system_;
    std::vector<Operation> operations_;
};

} // namespace

std::string describe(const Answer& answer) {
    std::string text = "status " + std::to_string(answer.status) + ", " +
                       std::to_string(answer.results.size()) + " results";
    for (const std::string& result : answer.results) {
        text += "\n  " + result;
    }
    return text;
}

std::vector<Operation> mixedOperations(Router& router, const Subjects& subjects) {
    return Catalogue(router, subjects).all();
}

Answer callMethod(Router& router, const std::string& className, const std::string& method,
                  const client::Arguments& arguments) {
    return answerOf(
        [&](Results&) { router.invokeMethod(nobody(), pathOf(className), method, arguments); });
}

Answer getNamed(Router& router, const std::string& className, const std::string& name) {
    return answerOf([&](Results& results) {
        results.push_back(
            textOf(router.getInstance(nobody(), named(className, name), std::nullopt)));
    });
}

client::Arguments::value_type textArgument(const std::string& name, const std::string& value) {
    return {name, Value::string(value)};
}

client::Arguments::value_type numberArgument(const std::string& name, std::uint32_t value) {
    return {name, Value::unsignedInteger(cim::Type::UInt32, value)};
}

} // namespace qelo::test
