#include "Program.h"

#include <nlohmann/json.hpp>

namespace qelo::cli {
namespace {

class InstanceCommands : public Program {
protected:
    void SetUp() override {
        manager.instances = {accountInstance("root", "Superuser", 0, 2),
                             accountInstance("a\"b", "", 1, 2)};
    }
};

TEST_F(InstanceCommands, Ein_prints_one_path_a_line) {
    EXPECT_EQ(run({"ein", "ZANTH_Account"}), 0);
    EXPECT_EQ(output.text(),
              "root/cimv2:ZANTH_Account.CreationClassName=\"ZANTH_Account\",Name=\"root\"\n"
              "root/cimv2:ZANTH_Account.CreationClassName=\"ZANTH_Account\",Name=\"a\\\"b\"\n");
    EXPECT_EQ(manager.operation, "enumerateInstanceNames");
}

TEST_F(InstanceCommands, What_ein_prints_gi_takes) {
    run({"ein", "ZANTH_Account"});
    const std::string second = output.text().substr(output.text().find('\n') + 1);
    EXPECT_EQ(run({"gi", second.substr(0, second.size() - 1)}), 0);
    EXPECT_EQ(manager.operation, "getInstance");
    EXPECT_EQ(manager.path, manager.instances[1].path());
}

TEST_F(InstanceCommands, Ein_as_json_carries_class_path_and_keys) {
    EXPECT_EQ(run({"ein", "ZANTH_Account", "--json"}), 0);
    const auto json = nlohmann::json::parse(output.text());
    ASSERT_EQ(json.size(), 2U);
    EXPECT_EQ(json[0]["class"], "ZANTH_Account");
    EXPECT_EQ(json[1]["keys"]["Name"], "a\"b");
    EXPECT_EQ(json[0]["path"],
              R"(root/cimv2:ZANTH_Account.CreationClassName="ZANTH_Account",Name="root")");
}

TEST_F(InstanceCommands, Ein_as_mof_is_the_keys_of_each_instance) {
    manager.instances.pop_back();
    EXPECT_EQ(run({"ein", "ZANTH_Account", "--format", "mof"}), 0);
    EXPECT_EQ(output.text(), "instance of ZANTH_Account {\n"
                             "    CreationClassName = \"ZANTH_Account\";\n"
                             "    Name = \"root\";\n"
                             "};\n");
}

TEST_F(InstanceCommands, Ei_asks_for_everything_by_default) {
    EXPECT_EQ(run({"ei", "ZANTH_Account"}), 0);
    EXPECT_EQ(manager.operation, "enumerateInstances");
    EXPECT_FALSE(manager.properties);
}

TEST_F(InstanceCommands, A_property_list_is_passed_on) {
    using List = std::vector<std::string>;
    EXPECT_EQ(run({"ei", "ZANTH_Account", "-p", "Name,UserID"}), 0);
    EXPECT_EQ(manager.properties, List({"Name", "UserID"}));
    EXPECT_EQ(run({"gi", "C.K=1", "--properties", "A", "-p", "B"}), 0);
    EXPECT_EQ(manager.properties, List({"A", "B"}));
    EXPECT_EQ(run({"ei", "-pA,B", "ZANTH_Account"}), 0);
    EXPECT_EQ(manager.properties, List({"A", "B"}));
}

TEST_F(InstanceCommands, An_empty_property_list_asks_for_the_path_only) {
    EXPECT_EQ(run({"ei", "ZANTH_Account", "-p", ""}), 0);
    ASSERT_TRUE(manager.properties);
    EXPECT_TRUE(manager.properties->empty());
}

TEST_F(InstanceCommands, A_property_list_of_no_names_is_refused) {
    EXPECT_EQ(run({"ei", "ZANTH_Account", "-p", "Na me"}), ExitUsage);
    EXPECT_EQ(errors.text(), "qelosim: not a property name: \"Na me\" (see qelosim ei --help)\n");
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(InstanceCommands, The_namespace_comes_from_the_path_or_the_options) {
    run({"ei", "ZANTH_Account"});
    EXPECT_EQ(manager.path.nameSpace(), "root/cimv2");
    run({"ei", "ZANTH_Account", "--namespace", "root/interop"});
    EXPECT_EQ(manager.path.nameSpace(), "root/interop");
    run({"--namespace", "root/interop", "gi", "C.K=1"});
    EXPECT_EQ(manager.path.nameSpace(), "root/interop");
    run({"gi", "root/other:C.K=1", "--namespace", "root/interop"});
    EXPECT_EQ(manager.path.nameSpace(), "root/other");
}

TEST_F(InstanceCommands, Gi_needs_keys_and_ei_takes_none) {
    EXPECT_EQ(run({"gi", "ZANTH_Account"}), ExitUsage);
    EXPECT_NE(errors.text().find("the path of an instance is expected"), std::string::npos);
    EXPECT_EQ(run({"ei", "ZANTH_Account.Name=\"x\""}), ExitUsage);
    EXPECT_EQ(run({"ein", "ZANTH_Account.Name=\"x\""}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(InstanceCommands, A_malformed_path_is_a_usage_error_that_says_where) {
    EXPECT_EQ(run({"gi", "ZANTH_Account.Name=x"}), ExitUsage);
    EXPECT_EQ(errors.text(), "qelosim: object path \"ZANTH_Account.Name=x\": a text must stand in "
                             "double quotes: unexpected value at character 20 "
                             "(see qelosim gi --help)\n");
}

TEST_F(InstanceCommands, The_keys_of_an_association_become_references) {
    run({"gi", R"(zanth_accounthostedservice.Antecedent="A.K=\"1\"",Dependent="ns:B.K=2")"});
    const cim::Value* antecedent = manager.path.key("Antecedent");
    ASSERT_NE(antecedent, nullptr);
    ASSERT_EQ(antecedent->type(), cim::Type::Reference);
    EXPECT_EQ(antecedent->asReference().className(), "A");
    EXPECT_EQ(antecedent->asReference().nameSpace(), "root/cimv2");
    EXPECT_EQ(antecedent->asReference().key("K")->asString(), "1");
    EXPECT_EQ(manager.path.key("Dependent")->asReference().nameSpace(), "ns");
}

TEST_F(InstanceCommands, A_key_of_an_association_that_is_no_path_is_a_usage_error) {
    EXPECT_EQ(run({"gi", R"(ZANTH_AccountHostedService.Antecedent="?")"}), ExitUsage);
}

TEST_F(InstanceCommands, Keys_of_other_classes_stay_texts) {
    run({"gi", R"(ZANTH_Group.Name="A.K=1")"});
    EXPECT_EQ(manager.path.key("Name")->type(), cim::Type::String);
}

TEST_F(InstanceCommands, Gi_as_json_is_an_array_of_one) {
    EXPECT_EQ(run({"gi", "C.K=1", "--json"}), 0);
    EXPECT_EQ(nlohmann::json::parse(output.text()).size(), 1U);
}

} // namespace
} // namespace qelo::cli
