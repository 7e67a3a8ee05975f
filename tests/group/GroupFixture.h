// What the tests of groups share: the provider under test, and store nodes of groups.
#pragma once

#include "support/operations/ProviderFixture.h"

#include <string>
#include <vector>

namespace qelo::test {

namespace source {
inline constexpr Unit group{"Corvane.SimpleIdentityManagementProvider", "SimGroup"};
inline constexpr Unit groupFactory{"Corvane.SimpleIdentityManagementProvider",
                                   "SimGroupObjFactory"};
inline constexpr Unit groupProvider{"Corvane.SimGroupProvider", "SimGroupProvider"};
} // namespace source

inline constexpr const char* pathFailedTrace =
    "Create CMPIObjectPath                     failed for RecordLogClass.";

// A group without any property.
inline StoreNode bareGroupNode() {
    return {Tesk::NodeLexicon::UserGroup, std::string(administrationPath) + "/group", {}};
}

inline StoreNode groupNode(const std::string& name, const std::vector<std::string>& members = {}) {
    StoreNode node = bareGroupNode();
    node.properties[Tesk::NodeLexicon::Name] = name;
    node.properties[Tesk::NodeLexicon::GroupMembers] = members;
    return node;
}

inline std::vector<NamedValue> groupKeys(const std::string& name) {
    return {{"CreationClassName", "ZANTH_Group"}, {"Name", name}};
}

class GroupFixture : public ProviderFixture {
protected:
    GroupFixture() : ProviderFixture({"SimGroupProvider", "ZANTH_Group", true, false}) {}

    // A store with an administration node and these groups.
    void serve(const std::vector<StoreNode>& groups) {
        platform_.addNode(administrationNode());
        for (const StoreNode& group : groups) {
            platform_.addNode(group);
        }
    }

    // The plain line with which every enumeration and look-up begins, and the one with which
    // it ends where it comes to its end.
    static ExpectedTrace plainLines(const std::string& operation, bool ends) {
        const std::string function = "SimGroup_" + operation;
        ExpectedTrace trace;
        trace.plain(source::groupProvider, function, function + ": entry");
        if (ends) {
            trace.plain(source::groupProvider, function, function + ": exit");
        }
        return trace;
    }
};

} // namespace qelo::test
