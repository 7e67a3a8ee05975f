// From the computer system to the capabilities, through the command line.
#include "Qelosim.h"

namespace qelo::endtoend {
namespace {

class Associations : public AccountDatabase {
protected:
    Finished ask(std::vector<std::string> arguments) const {
        arguments.insert(arguments.end(), {"--store", store()});
        return qelosim(std::move(arguments));
    }

    // The only path that a command prints.
    std::string onlyPath(std::vector<std::string> arguments) const {
        const Finished finished = ask(std::move(arguments));
        EXPECT_EQ(finished.status, 0) << finished.err;
        EXPECT_EQ(std::count(finished.out.begin(), finished.out.end(), '\n'), 1) << finished.out;
        return finished.out.substr(0, finished.out.find('\n'));
    }

    std::string system() const { return onlyPath({"ein", "ZANTH_ComputerSystem"}); }
    std::string service() const { return onlyPath({"ein", "ZANTH_AccountManagementService"}); }
    std::string capabilities() const {
        return onlyPath({"ein", "ZANTH_AccountManagementCapabilities"});
    }
};

TEST_F(Associations, The_computer_system_has_the_name_that_scopes_the_accounts) {
    const auto systems = qelosimJson({"ei", "ZANTH_ComputerSystem", "--store", store()});
    ASSERT_EQ(systems.size(), 1U);
    const auto& properties = systems[0]["properties"];
    const auto accounts = qelosimJson({"accounts", "--store", store()});
    EXPECT_EQ(properties["Name"], accounts.at(0)["properties"]["SystemName"]);
    EXPECT_EQ(properties["CreationClassName"], "ZANTH_ComputerSystem");
    EXPECT_EQ(properties["EnabledState"], 2);
    EXPECT_EQ(properties["OperationalStatus"], nlohmann::json::array({2}));
    EXPECT_EQ(properties["Dedicated"], nlohmann::json::array({0}));
    EXPECT_EQ(properties["OtherIdentifyingInfo"].size(),
              properties["IdentifyingDescriptions"].size());
    EXPECT_EQ(ask({"gi", system()}).status, 0);
    EXPECT_EQ(ask({"gi", "ZANTH_ComputerSystem.CreationClassName=\"ZANTH_ComputerSystem\","
                         "Name=\"another\""})
                  .status,
              6);
}

TEST_F(Associations, Every_end_leads_to_the_other) {
    EXPECT_EQ(onlyPath({"ain", system()}), service());
    EXPECT_EQ(onlyPath({"ain", service(), "-ac", "ZANTH_AccountHostedService"}), system());
    EXPECT_EQ(onlyPath({"ain", service(), "-ac", "ZANTH_SimElementCapabilities"}), capabilities());
    EXPECT_EQ(onlyPath({"ain", capabilities()}), service());
}

TEST_F(Associations, A_result_class_may_be_the_standard_parent) {
    EXPECT_EQ(onlyPath({"ain", service(), "-rc", "cim_computersystem"}), system());
    EXPECT_EQ(onlyPath({"ain", service(), "-rc", "CIM_AccountManagementCapabilities"}),
              capabilities());
    EXPECT_EQ(ask({"ain", service(), "-rc", "ZANTH_Group"}).out, "");
}

TEST_F(Associations, Roles_are_looked_at) {
    EXPECT_EQ(onlyPath({"ain", service(), "-r", "Dependent"}), system());
    EXPECT_EQ(onlyPath({"ain", service(), "-rr", "Capabilities"}), capabilities());
    EXPECT_EQ(ask({"ain", service(), "-r", "Antecedent"}).out, "");
}

TEST_F(Associations, References_name_both_ends) {
    const auto references = qelosimJson({"ri", system(), "--store", store()});
    ASSERT_EQ(references.size(), 1U);
    EXPECT_EQ(references[0]["class"], "ZANTH_AccountHostedService");
    const std::string path = onlyPath({"rin", system()});
    EXPECT_NE(path.find("Antecedent="), std::string::npos) << path;
    EXPECT_NE(path.find("Dependent="), std::string::npos) << path;
    EXPECT_EQ(path, onlyPath({"ein", "ZANTH_AccountHostedService"}));
}

TEST_F(Associations, An_association_is_found_by_its_own_path) {
    const Finished found = ask({"gi", onlyPath({"ein", "ZANTH_SimElementCapabilities"})});
    EXPECT_EQ(found.status, 0) << found.err;
}

TEST_F(Associations, The_tree_shows_the_whole_profile) {
    const Finished tree = ask({"tree"});
    EXPECT_EQ(tree.status, 0) << tree.err;
    const std::size_t root = tree.out.find("ZANTH_ComputerSystem ");
    const std::size_t service = tree.out.find("\n└── ZANTH_AccountManagementService ");
    const std::size_t leaf = tree.out.find("\n    └── ZANTH_AccountManagementCapabilities ");
    EXPECT_EQ(root, 0U) << tree.out;
    ASSERT_NE(service, std::string::npos) << tree.out;
    ASSERT_NE(leaf, std::string::npos) << tree.out;
    EXPECT_LT(service, leaf);
}

TEST_F(Associations, The_service_and_its_capabilities_are_listed) {
    EXPECT_NE(ask({"service"}).out.find("1 service\n"), std::string::npos);
    EXPECT_NE(ask({"capabilities"}).out.find("2,3,4"), std::string::npos);
    EXPECT_EQ(qelosimJson({"service", "--store", store()}).size(), 1U);
}

} // namespace
} // namespace qelo::endtoend
