#include "Program.h"

#include <nlohmann/json.hpp>

namespace qelo::cli {
namespace {

class GroupCommands : public Program {
protected:
    void addGroup(const char* name, const char* members) {
        cim::Instance group(cim::ObjectPath("root/cimv2", "ZANTH_Group"));
        group.setProperty("Name", cim::Value::string(name));
        group.setProperty("GroupMembers", cim::Value::string(members));
        manager.instances.push_back(group);
    }
};

class IdentityCommands : public Program {
protected:
    void SetUp() override {
        cim::Instance identity(cim::ObjectPath("root/cimv2", "ZANTH_SimIdentity"));
        identity.setProperty("InstanceID", cim::Value::string("ZANTH:1"));
        identity.setProperty("ElementName", cim::Value::string("SimIdentity"));
        manager.instances = {identity};
    }
};

TEST_F(GroupCommands, Groups_are_shown_with_their_members) {
    addGroup("adm", "root,alice");
    addGroup("empty", "");
    addGroup("one", "bob");
    EXPECT_EQ(run({"groups"}), 0);
    EXPECT_EQ(output.text(), "NAME   SIZE  MEMBERS\n"
                             "adm       2  root, alice\n"
                             "empty     0\n"
                             "one       1  bob\n"
                             "\n"
                             "3 groups\n");
    EXPECT_EQ(manager.path.className(), "ZANTH_Group");
}

TEST_F(GroupCommands, Groups_as_json_are_all_properties) {
    addGroup("adm", "root,alice");
    EXPECT_EQ(run({"groups", "--json"}), 0);
    EXPECT_FALSE(manager.properties);
    EXPECT_EQ(nlohmann::json::parse(output.text())[0]["properties"]["GroupMembers"], "root,alice");
}

TEST_F(IdentityCommands, The_identity_is_shown_with_its_id_and_name) {
    EXPECT_EQ(run({"identity"}), 0);
    EXPECT_EQ(output.text(), "INSTANCE ID  ELEMENT NAME\n"
                             "ZANTH:1      SimIdentity\n"
                             "\n"
                             "1 identity\n");
    EXPECT_EQ(manager.path.className(), "ZANTH_SimIdentity");
}

TEST_F(IdentityCommands, The_identity_as_json_is_all_properties) {
    EXPECT_EQ(run({"identity", "--json"}), 0);
    EXPECT_FALSE(manager.properties);
    EXPECT_EQ(nlohmann::json::parse(output.text())[0]["properties"]["InstanceID"], "ZANTH:1");
}

} // namespace
} // namespace qelo::cli
