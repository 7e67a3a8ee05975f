#include "Program.h"

#include <cli/render/Display.h>

#include <nlohmann/json.hpp>

#include <algorithm>
#include <sstream>

namespace qelo::cli {
namespace {

using AccountCommands = Program;

std::vector<std::string> linesOf(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

TEST_F(AccountCommands, Accounts_are_shown_as_a_table_with_a_count) {
    manager.instances = {accountInstance("root", "Superuser", 0, 2),
                         accountInstance("alice", "", 1000, 3)};
    EXPECT_EQ(run({"accounts"}), 0);
    EXPECT_EQ(output.text(), "NAME    UID   GID  STATE     FULL NAME  HOME         SHELL\n"
                             "root      0     0  enabled   Superuser  /home/root   /bin/bash\n"
                             "alice  1000  1000  disabled             /home/alice  /bin/bash\n"
                             "\n"
                             "2 accounts (1 disabled, 1 enabled)\n");
    EXPECT_EQ(errors.text(), "");
}

TEST_F(AccountCommands, Without_any_argument_the_accounts_are_listed) {
    manager.instances = {accountInstance("root", "Superuser", 0, 2)};
    EXPECT_EQ(run({}), 0);
    EXPECT_NE(output.text().find("root"), std::string::npos);
    EXPECT_NE(output.text().find("\n1 account (1 enabled)\n"), std::string::npos);
}

TEST_F(AccountCommands, The_table_asks_only_for_what_it_shows) {
    run({"accounts"});
    EXPECT_EQ(manager.operation, "enumerateInstances");
    EXPECT_EQ(manager.path, cim::ObjectPath("root/cimv2", "ZANTH_Account"));
    EXPECT_EQ(manager.path.nameSpace(), "root/cimv2");
    ASSERT_TRUE(manager.properties);
    EXPECT_EQ(std::count(manager.properties->begin(), manager.properties->end(), "Description"), 1);
    EXPECT_EQ(std::count(manager.properties->begin(), manager.properties->end(), "UserPassword"),
              0);
}

TEST_F(AccountCommands, No_accounts_are_a_count_of_none) {
    EXPECT_EQ(run({"accounts"}), 0);
    EXPECT_EQ(output.text(), "0 accounts\n");
}

TEST_F(AccountCommands, Every_state_has_its_word) {
    manager.instances = {accountInstance("a", "", 1, 2), accountInstance("b", "", 2, 3),
                         accountInstance("c", "", 3, 6), accountInstance("d", "", 4, 5)};
    run({"accounts"});
    const auto lines = linesOf(output.text());
    EXPECT_NE(lines.at(1).find("enabled"), std::string::npos);
    EXPECT_NE(lines.at(2).find("disabled"), std::string::npos);
    EXPECT_NE(lines.at(3).find("expired"), std::string::npos);
    EXPECT_NE(lines.at(4).find("unknown"), std::string::npos);
    EXPECT_EQ(lines.back(), "4 accounts (1 disabled, 1 enabled, 1 expired, 1 unknown)");
}

TEST_F(AccountCommands, A_missing_or_null_property_is_a_dash) {
    cim::Instance bare(cim::ObjectPath("root/cimv2", "ZANTH_Account"));
    bare.setProperty("Name", cim::Value::string("x"));
    bare.setProperty("HomeDirectory", cim::Value::null(cim::Type::String));
    manager.instances = {bare};
    EXPECT_EQ(run({"accounts"}), 0);
    EXPECT_EQ(linesOf(output.text()).at(1), "x       -    -  unknown  -          -     -");
}

TEST_F(AccountCommands, A_property_of_an_unexpected_type_does_no_harm) {
    cim::Instance odd(cim::ObjectPath("root/cimv2", "ZANTH_Account"));
    odd.setProperty("Name", cim::Value::array(cim::Type::String, {cim::Value::string("a")}));
    odd.setProperty("EnabledState", cim::Value::string("2"));
    odd.setProperty("GroupId", cim::Value::boolean(true));
    manager.instances = {odd};
    EXPECT_EQ(run({"accounts"}), 0);
    EXPECT_EQ(linesOf(output.text()).at(1), "a       -  true  enabled  -          -     -");
}

TEST_F(AccountCommands, A_hostile_full_name_sends_nothing_to_the_terminal) {
    output.becomeTerminal(200, true);
    manager.instances = {
        accountInstance("eve\x1b[2J", "\x1b]0;owned\x07\r\nroot 0\u202Egnp\u009b31m\xff", 7, 2)};
    run({"accounts"});
    const auto lines = linesOf(output.text());
    ASSERT_EQ(lines.size(), 4U);
    EXPECT_NE(lines[1].find(R"(eve\x001B[2J)"), std::string::npos);
    EXPECT_NE(lines[1].find(R"(\x001B]0;owned\x0007\r\nroot 0\x202Egnp\x009B31m\xFF)"),
              std::string::npos);
    EXPECT_EQ(lines[1].find('\x1b'), std::string::npos);
}

TEST_F(AccountCommands, Japanese_names_keep_the_columns_aligned) {
    manager.instances = {accountInstance("hanako", "山田 花子", 1, 2),
                         accountInstance("taro", "Yamada Taro", 2, 2)};
    run({"accounts"});
    const auto lines = linesOf(output.text());
    // Four wide characters and a blank take nine columns; the column has eleven.
    EXPECT_NE(lines[1].find("山田 花子    /home"), std::string::npos);
    EXPECT_NE(lines[2].find("Yamada Taro  /home"), std::string::npos);
}

TEST_F(AccountCommands, On_a_terminal_no_line_is_wider_than_it) {
    manager.instances = {accountInstance("alice", std::string(300, 'x'), 1000, 2),
                         accountInstance("bob", "山田 花子山田 花子山田 花子", 1001, 2)};
    for (std::size_t columns = 60; columns < 130; ++columns) {
        output = RecordingOutput();
        output.becomeTerminal(columns);
        run({"accounts"});
        const std::string table = output.text().substr(0, output.text().find("\n\n"));
        EXPECT_NE(table.find("…"), std::string::npos);
        EXPECT_NE(table.find("alice  1000  1000  enabled"), std::string::npos) << columns;
        for (const std::string& line : linesOf(table)) {
            EXPECT_LE(displayWidth(line), columns) << line;
        }
    }
}

TEST_F(AccountCommands, Elsewhere_every_text_is_written_whole) {
    manager.instances = {accountInstance("alice", std::string(300, 'x'), 1000, 2)};
    run({"accounts"});
    EXPECT_NE(output.text().find(std::string(300, 'x')), std::string::npos);
}

TEST_F(AccountCommands, Colours_appear_only_where_they_are_welcome) {
    manager.instances = {accountInstance("alice", "", 1000, 3)};
    run({"accounts"});
    EXPECT_EQ(output.text().find('\x1b'), std::string::npos);
    output = RecordingOutput();
    output.becomeTerminal(80, true);
    run({"accounts"});
    EXPECT_NE(output.text().find("\x1b[1mNAME"), std::string::npos);
    EXPECT_NE(output.text().find("\x1b[2mdisabled\x1b[0m"), std::string::npos);
}

TEST_F(AccountCommands, Json_carries_all_properties) {
    manager.instances = {accountInstance("root", "Superuser", 0, 2)};
    EXPECT_EQ(run({"accounts", "--json"}), 0);
    EXPECT_FALSE(manager.properties);
    const auto json = nlohmann::json::parse(output.text());
    ASSERT_EQ(json.size(), 1U);
    EXPECT_EQ(json[0]["class"], "ZANTH_Account");
    EXPECT_EQ(json[0]["properties"]["Description"], "Superuser");
    EXPECT_EQ(json[0]["properties"]["FullName"], "");
    EXPECT_EQ(json[0]["properties"]["GroupId"], 0);
}

TEST_F(AccountCommands, Json_needs_no_command) {
    EXPECT_EQ(run({"--json"}), 0);
    EXPECT_EQ(output.text(), "[]\n");
    EXPECT_EQ(manager.path.className(), "ZANTH_Account");
}

TEST_F(AccountCommands, Mof_is_an_instance_each) {
    manager.instances = {accountInstance("root", "Superuser", 0, 2)};
    EXPECT_EQ(run({"accounts", "--format", "mof"}), 0);
    EXPECT_EQ(output.text().find("instance of ZANTH_Account {\n"), 0U);
}

} // namespace
} // namespace qelo::cli
