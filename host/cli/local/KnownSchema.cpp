#include "KnownSchema.h"

#include <cim/ObjectPath.h>

#include <algorithm>

namespace qelo::cli {
namespace {

struct SchemaClass {
    const char* name;
    const char* superclass; // empty: none
    std::vector<std::string> keys;
};

const std::vector<std::string> kScopedKeys = {"SystemCreationClassName", "SystemName",
                                              "CreationClassName", "Name"};
const std::vector<std::string> kNamedKeys = {"CreationClassName", "Name"};
const std::vector<std::string> kInstanceId = {"InstanceID"};

const std::vector<SchemaClass>& schema() {
    static const std::vector<SchemaClass> classes = {
        {"ZANTH_Account", "CIM_Account", kScopedKeys},
        {"ZANTH_Group", "CIM_Group", kNamedKeys},
        {"ZANTH_SimIdentity", "CIM_Identity", kInstanceId},
        {"ZANTH_AccountManagementService", "CIM_AccountManagementService", kScopedKeys},
        {"ZANTH_AccountManagementCapabilities", "CIM_AccountManagementCapabilities", kInstanceId},
        {"ZANTH_AccountHostedService", "CIM_HostedService", {"Antecedent", "Dependent"}},
        {"ZANTH_SimElementCapabilities",
         "CIM_ElementCapabilities",
         {"ManagedElement", "Capabilities"}},
        {"ZANTH_ComputerSystem", "CIM_ComputerSystem", kNamedKeys},
        {"CIM_Account", "CIM_EnabledLogicalElement", kScopedKeys},
        {"CIM_Group", "CIM_Collection", kNamedKeys},
        {"CIM_Collection", "CIM_ManagedElement", {}},
        {"CIM_Identity", "CIM_ManagedElement", kInstanceId},
        {"CIM_AccountManagementService", "CIM_SecurityService", kScopedKeys},
        {"CIM_SecurityService", "CIM_Service", kScopedKeys},
        {"CIM_Service", "CIM_EnabledLogicalElement", kScopedKeys},
        {"CIM_AccountManagementCapabilities", "CIM_EnabledLogicalElementCapabilities", kInstanceId},
        {"CIM_EnabledLogicalElementCapabilities", "CIM_Capabilities", kInstanceId},
        {"CIM_Capabilities", "CIM_ManagedElement", kInstanceId},
        {"CIM_HostedService", "CIM_HostedDependency", {"Antecedent", "Dependent"}},
        {"CIM_HostedDependency", "CIM_Dependency", {"Antecedent", "Dependent"}},
        {"CIM_Dependency", "", {"Antecedent", "Dependent"}},
        {"CIM_ElementCapabilities", "", {"ManagedElement", "Capabilities"}},
        {"CIM_ComputerSystem", "CIM_System", kNamedKeys},
        {"CIM_System", "CIM_EnabledLogicalElement", kNamedKeys},
        {"CIM_EnabledLogicalElement", "CIM_LogicalElement", {}},
        {"CIM_LogicalElement", "CIM_ManagedSystemElement", {}},
        {"CIM_ManagedSystemElement", "CIM_ManagedElement", {}},
        {"CIM_ManagedElement", "", {}},
    };
    return classes;
}

const SchemaClass* find(const std::string& name) {
    const auto found = std::find_if(schema().begin(), schema().end(), [&](const auto& known) {
        return cim::sameName(known.name, name);
    });
    return found == schema().end() ? nullptr : &*found;
}

bool isA(const std::string& sub, const std::string& super) {
    if (cim::sameName(sub, super)) {
        return true;
    }
    for (const SchemaClass* known = find(sub); known != nullptr; known = find(known->superclass)) {
        if (cim::sameName(known->superclass, super)) {
            return true;
        }
    }
    return false;
}

std::optional<std::vector<std::string>> keyNames(const std::string& className) {
    const SchemaClass* known = find(className);
    return known == nullptr ? std::nullopt : std::make_optional(known->keys);
}

} // namespace

broker::SchemaHooks knownSchema() {
    broker::SchemaHooks hooks;
    hooks.isA = [](const std::string&, const std::string& sub, const std::string& super) {
        return isA(sub, super);
    };
    hooks.keyNames = [](const std::string&, const std::string& className) {
        return keyNames(className);
    };
    return hooks;
}

} // namespace qelo::cli
