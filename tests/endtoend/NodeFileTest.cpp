#include "Qelosim.h"

namespace qelo::endtoend {
namespace {

// Node types and properties of the store.
constexpr int kUserAdministration = 17;
constexpr int kUserAccount = 46;
constexpr int kUserGroup = 51;

class NodeFile : public ::testing::Test {
protected:
    NodeFile() { add(kUserAdministration, "/UserAdministration/1", {}); }

    void add(int type, const std::string& path, const nlohmann::json& properties) {
        nlohmann::json node = {{"type", type}, {"path", path}};
        if (!properties.empty()) {
            node["properties"] = properties;
        }
        nodes_.push_back(node);
    }
    void addAccount(const std::string& name, const nlohmann::json& more = {}) {
        nlohmann::json properties = {{"108", name}, {"89", "7"}, {"123", 1}};
        properties.update(more.is_null() ? nlohmann::json::object() : more);
        add(kUserAccount, "/UserAdministration/1/UserAccount/" + std::to_string(nodes_.size()),
            properties);
    }
    std::string store() {
        return "file:" + scratch.write("nodes.json", nlohmann::json{{"nodes", nodes_}}.dump());
    }

    Scratch scratch;

private:
    nlohmann::json nodes_ = nlohmann::json::array();
};

TEST_F(NodeFile, Accounts_and_groups_come_from_the_file) {
    addAccount("zoe", {{"312", "Zoë"}, {"311", "8"}, {"158", "/z"}, {"159", "/bin/z"}});
    add(kUserGroup, "/UserAdministration/1/UserGroup/g", {{"108", "g"}, {"165", {"zoe", "x"}}});
    const auto accounts = qelosimJson({"accounts", "--store", store()});
    ASSERT_EQ(accounts.size(), 1U);
    EXPECT_EQ(accounts[0]["properties"]["Name"], "zoe");
    EXPECT_EQ(accounts[0]["properties"]["Description"], "Zoë");
    EXPECT_EQ(accounts[0]["properties"]["GroupId"], 8);
    const auto groups = qelosimJson({"groups", "--store", store()});
    ASSERT_EQ(groups.size(), 1U);
    EXPECT_EQ(groups[0]["properties"]["GroupMembers"], "zoe,x");
}

TEST_F(NodeFile, The_environment_chooses_the_store_and_the_option_overrides_it) {
    addAccount("fromfile");
    const Variables variables = {{"QELO_NODE_STORE", store()}};
    const Finished fromEnvironment = runProcess(qelosimCommand({}), variables);
    EXPECT_NE(fromEnvironment.out.find("fromfile"), std::string::npos) << fromEnvironment.err;
    scratch.write("root/etc/passwd", "other:x:1:1::/:/bin/sh\n");
    const Finished fromOption =
        runProcess(qelosimCommand({"--store", "accounts:" + scratch.path("root")}), variables);
    EXPECT_EQ(fromOption.out.find("fromfile"), std::string::npos);
    EXPECT_NE(fromOption.out.find("other"), std::string::npos) << fromOption.err;
}

TEST_F(NodeFile, Non_ASCII_texts_do_not_depend_on_the_locale) {
    addAccount("hanako", {{"312", "山田 花子"}, {"158", "/home/山田"}});
    for (const char* locale : {"C", "POSIX", "C.UTF-8", "no_SUCH.locale"}) {
        const Finished finished =
            runProcess(qelosimCommand({"--store", store()}), {{"LC_ALL", locale}});
        EXPECT_NE(finished.out.find("山田 花子"), std::string::npos) << locale;
        EXPECT_NE(finished.out.find("/home/山田"), std::string::npos) << locale << finished.out;
    }
}

TEST_F(NodeFile, Hostile_names_are_escaped_and_can_be_asked_for_again) {
    const std::string name = "a\"b\\c,d=e\x1b[31m\n\u202e";
    addAccount(name);
    const Finished paths = qelosim({"ein", "ZANTH_Account", "--store", store()});
    ASSERT_EQ(paths.status, 0) << paths.err;
    EXPECT_EQ(paths.out.find('\n'), paths.out.size() - 1);
    EXPECT_EQ(paths.out.find('\x1b'), std::string::npos);
    const auto instance =
        qelosimJson({"gi", paths.out.substr(0, paths.out.size() - 1), "--store", store()});
    ASSERT_EQ(instance.size(), 1U);
    EXPECT_EQ(instance[0]["properties"]["Name"], name);
}

TEST_F(NodeFile, Thousands_of_accounts_are_all_listed) {
    constexpr std::size_t number = 2000;
    for (std::size_t i = 0; i < number; ++i) {
        addAccount("user" + std::to_string(i));
    }
    EXPECT_EQ(qelosimJson({"accounts", "--store", store()}).size(), number);
    const Finished table = qelosim({"accounts", "--store", store()});
    EXPECT_NE(table.out.find("\n2000 accounts (2000 enabled)\n"), std::string::npos);
}

TEST_F(NodeFile, An_empty_store_is_no_error) {
    const Finished finished = qelosim({"accounts", "--store", store()});
    EXPECT_EQ(finished.status, 0);
    EXPECT_EQ(finished.out, "0 accounts\n");
    EXPECT_EQ(finished.err, "");
}

} // namespace
} // namespace qelo::endtoend
