// The catalogue of operations.
#include "SweptLibrary.h"

#include <utility>

namespace qelo::test {

namespace {

constexpr const char* kNameSpace = "root/cimv2";

// What a request for one instance names.
struct Served {
    const char* className;
    const char* key;   // by which one instance is looked up
    std::string value; // of an instance that is there
    const char* someProperty;
    std::size_t records; // that a good enumeration returns
};

const std::map<std::string, Served>& served() {
    static const std::map<std::string, Served> all = {
        {"SimAccountProvider",
         {"ZANTH_Account", "Name", "an account with quite a long name", "UserID", 2}},
        {"SimGroupProvider",
         {"ZANTH_Group", "Name", "a group with quite a long name", "ElementName", 2}},
        {"SimIdentityProvider",
         {"ZANTH_SimIdentity", "InstanceID", "ZANTH:SimIdentity1", "ElementName", 1}},
        {"SimAccountManagementServiceProvider",
         {"ZANTH_AccountManagementService", "Name", "SimAccountManagementService_node:/b",
          "ElementName", 2}},
        {"SimAccountManagementCapabilitiesProvider",
         {"ZANTH_AccountManagementCapabilities", "InstanceID",
          "SimAccountManagementCapabilities_node:/b", "ElementName", 2}},
        {"SimAccountHostedServiceProvider",
         {"ZANTH_AccountHostedService", "Antecedent", "", "Dependent", 4}},
        {"SimElementCapabilitiesProvider",
         {"ZANTH_SimElementCapabilities", "ManagedElement", "", "Capabilities", 4}},
        {"QeloComputerSystemProvider",
         {"ZANTH_ComputerSystem", "Name", "host.example", "ElementName", 1}},
    };
    return all;
}

// Property lists in the form of the interface.
const char** nothingOf() {
    static const char* list[] = {nullptr};
    return list;
}

const char** someOf(const Served& served) {
    static std::map<std::string, std::array<const char*, 3>> lists;
    auto& list = lists[served.className];
    list = {served.key, served.someProperty, nullptr};
    return list.data();
}

class Catalogue {
public:
    Catalogue(SweptLibrary& library, const std::string& provider)
        : broker_(library.broker()), interfaces_(library.interfaces(provider)),
          served_(served().at(provider)) {}

    std::vector<SweptOperation> all() {
        addEnumerations();
        addLookups();
        addRefusals();
        if (interfaces_.methods != nullptr) {
            addMethods();
        }
        if (interfaces_.associations != nullptr) {
            addAssociations();
        }
        return std::move(operations_);
    }

private:
    using Keys = std::vector<NamedValue>;

    template <class Call> SweptOperation& add(std::string name, Call call) {
        operations_.push_back({std::move(name), call});
        return operations_.back();
    }

    CMPIObjectPath* path(const char* className, const Keys& keys = {}) {
        return broker_.makePath(kNameSpace, className, keys);
    }

    std::vector<std::pair<const char*, const char**>> lists() const {
        return {{"", nullptr}, {"OfSome", someOf(served_)}, {"OfNothing", nothingOf()}};
    }

    void addEnumerations() {
        CMPIInstanceMI* const mi = interfaces_.instances;
        const CMPIObjectPath* const ref = path(served_.className);
        add("EnumInstanceNames", [=](auto context, auto result) {
            return mi->ft->enumerateInstanceNames(mi, context, result, ref);
        });
        for (const auto& [suffix, names] : lists()) {
            add(std::string("EnumInstances") + suffix, [=, names = names](auto context,
                                                                          auto result) {
                return mi->ft->enumerateInstances(mi, context, result, ref, names);
            }).distinct = names != nothingOf();
        }
    }

    void addLookup(const std::string& name, const Keys& keys, const char** names = nullptr) {
        CMPIInstanceMI* const mi = interfaces_.instances;
        const CMPIObjectPath* const ref = path(served_.className, keys);
        // A key that cannot be read counts as missing, and then every instance is returned.
        SweptOperation& lookup = add("GetInstance" + name, [=](auto context, auto result) {
            return mi->ft->getInstance(mi, context, result, ref, names);
        });
        lookup.most = served_.records;
        lookup.distinct = names != nothingOf();
    }

    Value keyValue() {
        if (!served_.value.empty()) {
            return Value(served_.value);
        }
        const bool hosted = served_.className == std::string("ZANTH_AccountHostedService");
        return Value::ref(
            broker_.inspect(path(hosted ? "ZANTH_ComputerSystem" : "ZANTH_AccountManagementService",
                                 {{"Name", "zeta"}})));
    }

    void addLookups() {
        const Value known = keyValue();
        for (const auto& [suffix, names] : lists()) {
            addLookup(suffix, {{"CreationClassName", served_.className}, {served_.key, known}},
                      names);
        }
        addLookup("Unknown", {{served_.key, "no such instance"}});
        addLookup("WithoutItsKey", {{"CreationClassName", served_.className}});
        addLookup("WithoutKeys", {});
        addLookup("OfANumber", {{served_.key, Value::uint32(7)}});
        addLookup("OfANull", {{served_.key, Value::nullOf(CMPI_string)}});
        addLookup("OfAMissingText", {{served_.key, Value::missing(CMPI_string)}});
    }

    void addRefusals() {
        CMPIInstanceMI* const mi = interfaces_.instances;
        const CMPIObjectPath* const ref = path(served_.className, {{served_.key, keyValue()}});
        const CMPIInstance* const instance =
            broker_.makeInstance(broker_.inspect(ref), {{served_.someProperty, "text"}});
        const char** const names = someOf(served_);
        add("CreateInstance", [=](auto context, auto result) {
            return mi->ft->createInstance(mi, context, result, ref, instance);
        });
        add("ModifyInstance", [=](auto context, auto result) {
            return mi->ft->modifyInstance(mi, context, result, ref, instance, names);
        });
        add("DeleteInstance", [=](auto context, auto result) {
            return mi->ft->deleteInstance(mi, context, result, ref);
        });
        add("ExecQuery", [=](auto context, auto result) {
            return mi->ft->execQuery(mi, context, result, ref, "select * from C", "WQL");
        });
        for (const CMPIBoolean terminating : {CMPIBoolean{0}, CMPIBoolean{1}}) {
            add(terminating ? "CleanupAtTheEnd" : "Cleanup",
                [=](auto context, auto) { return mi->ft->cleanup(mi, context, terminating); });
        }
    }

    // One argument of every type that a method can be given, and of every way to have none.
    CMPIArgs* argumentsOfAllTypes() {
        const Path target = broker_.inspect(path(served_.className, {{"Name", "x"}}));
        ArgsBuilder args = broker_.makeArgs();
        args.string("Text", "a text that is quite long").string("Empty", "").nullString("Null");
        args.stringWithoutValue("Missing").boolean("Flag", true).uint8("U8", 255);
        args.uint16("U16", 65535).uint32("U32", 4294967295U).uint64("U64", ~CMPIUint64{0});
        args.sint32("S32", -1).dateTime("When", "20140307123005.000000+000");
        args.add("S8", Value::sint8(-128)).add("S16", Value::sint16(-32768));
        args.add("S64", Value::sint64(-1)).add("R32", Value::real32(0.5F));
        args.add("R64", Value::real64(-0.25)).add("Target", Value::ref(target));
        args.add("Whole", Value::embedded({target, {{"Name", "x"}}}));
        args.add("Texts", Value::array(CMPI_string, {"a", "b"}));
        args.add("Numbers", Value::array(CMPI_uint32, {Value::uint32(1), Value::uint32(2)}));
        for (const CMPIType type :
             std::initializer_list<CMPIType>{CMPI_uint32, CMPI_dateTime, CMPI_boolean, CMPI_ref}) {
            args.nullOf("NullOf" + typeName(type), type);
        }
        args.add("NoDate", Value::missing(CMPI_dateTime));
        return args.get();
    }

    void addMethod(const std::string& name, const char* method, const CMPIArgs* in,
                   const char* className) {
        CMPIMethodMI* const mi = interfaces_.methods;
        const CMPIObjectPath* const ref = path(className, {{"Name", "x"}});
        CMPIArgs* const out = broker_.makeArgs();
        add("InvokeMethod" + name, [=](auto context, auto result) {
            return mi->ft->invokeMethod(mi, context, result, ref, method, in, out);
        });
    }

    void addMethods() {
        const bool group = served_.className == std::string("ZANTH_Group");
        const char* const known = group ? "CreateGroup" : "CreateUser";
        const CMPIArgs* const usual =
            broker_.makeArgs()
                .string("Name", "a name that is quite long")
                .uint32("UserID", 1000)
                .dateTime("PasswordExpiration", "20140307123005.000000+000")
                .get();
        addMethod("", known, usual, served_.className);
        addMethod("Unknown", "NoSuchMethod", usual, served_.className);
        addMethod("OfAllTypes", known, argumentsOfAllTypes(), served_.className);
        addMethod("OfNothing", known, broker_.makeArgs(), served_.className);
        addMethod("WithoutArguments", known, nullptr, served_.className);
        addMethod("OfAnotherClass", known, usual, "ZANTH_ComputerSystem");
        CMPIMethodMI* const mi = interfaces_.methods;
        for (const CMPIBoolean terminating : {CMPIBoolean{0}, CMPIBoolean{1}}) {
            add(terminating ? "MethodCleanupAtTheEnd" : "MethodCleanup",
                [=](auto context, auto) { return mi->ft->cleanup(mi, context, terminating); });
        }
    }

    // The objects that the association's two ends and others are asked about.
    std::vector<std::pair<std::string, const CMPIObjectPath*>> sources() {
        const bool hosted = served_.className == std::string("ZANTH_AccountHostedService");
        const char* const far = hosted ? "ZANTH_ComputerSystem" : "ZANTH_AccountManagementService";
        const char* const near =
            hosted ? "ZANTH_AccountManagementService" : "ZANTH_AccountManagementCapabilities";
        const Keys farKeys = {{"CreationClassName", far}, {"Name", "zeta"}};
        const Keys nearKeys = {{hosted ? "Name" : "InstanceID",
                                std::string(hosted ? "SimAccountManagementService_node:"
                                                   : "SimAccountManagementCapabilities_node:") +
                                    "/a"}};
        return {{"OfFar", path(far, farKeys)},
                {"OfNear", path(near, nearKeys)},
                {"OfAnother", path("ZANTH_Account", {{"Name", "bob"}})}};
    }

    void addAssociators(const std::string& suffix, const CMPIObjectPath* source,
                        const char* assocClass, const char* resultClass) {
        CMPIAssociationMI* const mi = interfaces_.associations;
        add("Associators" + suffix, [=](auto context, auto result) {
            return mi->ft->associators(mi, context, result, source, assocClass, resultClass,
                                       nullptr, nullptr, nullptr);
        });
        add("AssociatorNames" + suffix, [=](auto context, auto result) {
            return mi->ft->associatorNames(mi, context, result, source, assocClass, resultClass,
                                           nullptr, nullptr);
        });
    }

    void addReferences(const std::string& suffix, const CMPIObjectPath* source,
                       const char* resultClass) {
        CMPIAssociationMI* const mi = interfaces_.associations;
        add("References" + suffix, [=](auto context, auto result) {
            return mi->ft->references(mi, context, result, source, resultClass, nullptr, nullptr);
        });
        // The recording broker's instances have no keys in their path, so the names of
        // references all look the same.
        add("ReferenceNames" + suffix, [=](auto context, auto result) {
            return mi->ft->referenceNames(mi, context, result, source, resultClass, nullptr);
        }).distinct = false;
    }

    void addAssociations() {
        const char* const own = served_.className;
        for (const auto& [end, source] : sources()) {
            addAssociators(end, source, own, nullptr);
            addAssociators(end + "AlongAny", source, nullptr, nullptr);
            addAssociators(end + "AlongAnother", source, "ZANTH_Account", nullptr);
            addAssociators(end + "ToService", source, own, "ZANTH_AccountManagementService");
            addAssociators(end + "ToAnother", source, own, "ZANTH_Account");
            addReferences(end, source, nullptr);
            addReferences(end + "OfItsClass", source, own);
            addReferences(end + "OfAnotherClass", source, "ZANTH_Account");
        }
        CMPIAssociationMI* const mi = interfaces_.associations;
        for (const CMPIBoolean terminating : {CMPIBoolean{0}, CMPIBoolean{1}}) {
            add(terminating ? "AssociationCleanupAtTheEnd" : "AssociationCleanup",
                [=](auto context, auto) { return mi->ft->cleanup(mi, context, terminating); });
        }
    }

    RecordingBroker& broker_;
    const Interfaces interfaces_;
    const Served& served_;
    std::vector<SweptOperation> operations_;
};

} // namespace

std::vector<SweptOperation> operationsOf(SweptLibrary& library, const std::string& provider) {
    return Catalogue(library, provider).all();
}

} // namespace qelo::test
