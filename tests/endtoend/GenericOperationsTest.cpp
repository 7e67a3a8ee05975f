#include "Qelosim.h"

namespace qelo::endtoend {
namespace {

using GenericOperations = AccountDatabase;

TEST_F(GenericOperations, Every_path_that_ein_prints_can_be_got) {
    for (const char* className :
         {"ZANTH_Account", "ZANTH_Group", "ZANTH_AccountManagementService",
          "ZANTH_AccountManagementCapabilities", "ZANTH_SimElementCapabilities"}) {
        const auto paths = json({"ein", className});
        EXPECT_FALSE(paths.empty()) << className;
        for (const auto& path : paths) {
            const auto instance = json({"gi", path["path"]});
            ASSERT_EQ(instance.size(), 1U);
            EXPECT_EQ(instance[0]["path"], path["path"]);
        }
    }
}

TEST_F(GenericOperations, Ei_and_gi_agree) {
    for (const auto& account : json({"ei", "ZANTH_Account"})) {
        EXPECT_EQ(json({"gi", account["path"]})[0], account);
    }
}

TEST_F(GenericOperations, A_property_list_limits_what_is_returned) {
    const auto account = json({"ei", "ZANTH_Account", "-p", "HomeDirectory,GroupId"})[0];
    EXPECT_EQ(account["path"], pathOf("ZANTH_Account", "alice"));
    EXPECT_EQ(account["properties"]["HomeDirectory"], "/home/alice");
    EXPECT_EQ(account["properties"]["GroupId"], 1000);
    EXPECT_FALSE(account["properties"].contains("Description"));
    const auto bare = json({"ei", "ZANTH_Account", "-p", ""})[0];
    EXPECT_EQ(bare["path"], account["path"]);
    EXPECT_FALSE(bare["properties"].contains("HomeDirectory"));
}

TEST_F(GenericOperations, An_account_that_does_not_exist_is_not_found) {
    std::string path = pathOf("ZANTH_Account", "alice");
    path.replace(path.find("alice"), 5, "nobody");
    const Finished finished = run({"gi", path});
    EXPECT_EQ(finished.status, 6);
    EXPECT_EQ(finished.out, "");
    EXPECT_NE(finished.err.find("CIM_ERR_NOT_FOUND"), std::string::npos);
}

TEST_F(GenericOperations, An_unknown_class_is_an_invalid_class) {
    for (const char* command : {"ein", "ei"}) {
        const Finished finished = run({command, "ZANTH_Nothing"});
        EXPECT_EQ(finished.status, 5);
        EXPECT_EQ(finished.out, "");
        EXPECT_NE(finished.err.find("ZANTH_Nothing"), std::string::npos);
        EXPECT_NE(finished.err.find("CIM_ERR_INVALID_CLASS"), std::string::npos);
    }
}

TEST_F(GenericOperations, An_unknown_namespace_is_an_invalid_namespace) {
    EXPECT_EQ(run({"ei", "ZANTH_Account", "--namespace", "root/nowhere"}).status, 3);
}

TEST_F(GenericOperations, The_capabilities_of_the_service_are_found_over_their_association) {
    const std::string service = json({"ein", "ZANTH_AccountManagementService"})[0]["path"];
    const std::string expected = json({"ein", "ZANTH_AccountManagementCapabilities"})[0]["path"];
    const auto names = json({"ain", service, "-ac", "ZANTH_SimElementCapabilities"});
    ASSERT_EQ(names.size(), 1U);
    EXPECT_EQ(names[0]["path"], expected);
    const auto instances = json({"ai", service, "-ac", "ZANTH_SimElementCapabilities"});
    ASSERT_EQ(instances.size(), 1U);
    EXPECT_EQ(instances[0]["class"], "ZANTH_AccountManagementCapabilities");
    const auto references = json({"rin", service, "-rc", "ZANTH_SimElementCapabilities"});
    ASSERT_EQ(references.size(), 1U);
    EXPECT_EQ(references[0]["keys"]["Capabilities"], expected);
    EXPECT_EQ(references[0]["keys"]["ManagedElement"], service);
    EXPECT_EQ(json({"ri", service, "-rc", "ZANTH_SimElementCapabilities"}).size(), 1U);
}

TEST_F(GenericOperations, A_class_without_methods_refuses_a_call) {
    const Finished finished = run({"cm", "ZANTH_SimIdentity", "Anything"});
    EXPECT_NE(finished.status, 0);
    EXPECT_EQ(finished.out, "");
    EXPECT_NE(finished.err.find("qelosim: cm: "), std::string::npos);
}

TEST_F(GenericOperations, An_unknown_method_fails_and_changes_nothing) {
    const auto before = json({"accounts"});
    const Finished finished =
        run({"cm", pathOf("ZANTH_Account", "alice"), "NoSuchMethod", "Name=mallory"});
    EXPECT_EQ(finished.status, 17);
    EXPECT_EQ(finished.out, "");
    EXPECT_NE(finished.err.find("ZANTH_Account has no method \"NoSuchMethod\""), std::string::npos);
    EXPECT_EQ(json({"accounts"}), before);
}

TEST_F(GenericOperations, Mof_lists_every_property_of_every_account) {
    const Finished finished = run({"ei", "ZANTH_Account", "--format", "mof"});
    EXPECT_EQ(finished.status, 0) << finished.err;
    EXPECT_NE(finished.out.find("instance of ZANTH_Account {\n"), std::string::npos);
    EXPECT_NE(finished.out.find("    Description = \"山田 花子\";\n"), std::string::npos);
    EXPECT_NE(finished.out.find("    AccountDisable = TRUE;\n"), std::string::npos);
    EXPECT_NE(finished.out.find("    passwordLastChanged = \"20220108000000.000000+000\";\n"),
              std::string::npos);
}

} // namespace
} // namespace qelo::endtoend
