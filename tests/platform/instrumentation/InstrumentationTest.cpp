// The public class over the store that the environment chooses.
#include "FakeFiles.h"
#include "StoreListing.h"
#include "TestLog.h"

#include <Instrumentation.h>

#include <gmock/gmock.h>

#include <stdexcept>
#include <type_traits>
#include <unistd.h>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;
using Tesk::Instrumentation;
using testing::ElementsAre;
using testing::HasSubstr;

class InstrumentationCursor : public testing::Test {
protected:
    InstrumentationCursor() {
        clearLog();
        root.write("etc/passwd", "alice:x:1:1:A:/a:/bin/sh\nbob:x:2:2:B:/b:/bin/sh\n");
        root.write("etc/shadow", "alice:h:19000:0:99999:7:::\nbob:!:19000:0:99999:7:::\n");
        root.write("etc/group", "staff:x:50:alice\n");
    }
    ScratchRoot root;
    ScopedVariable variable{"QELO_NODE_STORE", root.choice()};
};

unsigned int numberOf(Instrumentation& cursor, Tesk::NodeLexicon::Properties id) {
    unsigned int value = 0;
    EXPECT_TRUE(cursor.getProperty(id, value));
    return value;
}

std::vector<std::string> accountsNow() {
    std::vector<std::string> names;
    Instrumentation cursor;
    for (cursor.selectNode(UserAccount); cursor; ++cursor) {
        std::string name;
        EXPECT_TRUE(cursor.getProperty(Name, name));
        names.push_back(name);
    }
    return names;
}

// As the provider does before each request; true when it asked for a refresh.
bool refreshIfCountsDiffer() {
    Instrumentation cursor;
    cursor.selectNode(UserAccount);
    if (!cursor || numberOf(cursor, EntryCount) == cursor.getNodeSize()) {
        return false;
    }
    Instrumentation administration;
    administration.selectNode(UserAdministration);
    unsigned int zero = 0;
    return administration && administration.setProperty(RefreshRequest, zero);
}

} // namespace

TEST(Instrumentation, Holds_exactly_one_pointer) {
    EXPECT_EQ(sizeof(Tesk::Instrumentation), sizeof(void*));
    EXPECT_FALSE(std::is_polymorphic_v<Tesk::Instrumentation>);
    EXPECT_FALSE(std::is_copy_constructible_v<Tesk::Instrumentation>);
}

TEST_F(InstrumentationCursor, A_fresh_one_stands_nowhere) {
    Instrumentation cursor;
    std::string text = "kept";
    unsigned int number = 7;
    EXPECT_FALSE(cursor);
    EXPECT_EQ(cursor.getNodeSize(), 0U);
    EXPECT_EQ(cursor.getPathToNode(), "");
    EXPECT_FALSE(cursor.getProperty(Name, text));
    EXPECT_FALSE(cursor.getProperty(EntryCount, number));
    EXPECT_FALSE(cursor.setProperty(AdminCommand, text));
    EXPECT_FALSE(cursor.setProperty(RefreshRequest, number));
    EXPECT_FALSE(cursor.setFilter(ParentPath, ""));
    EXPECT_FALSE(++cursor);
    EXPECT_EQ(text, "kept");
    EXPECT_EQ(number, 7U);
}

TEST_F(InstrumentationCursor, Walks_the_listing_pattern_of_accounts) {
    Instrumentation cursor;
    EXPECT_TRUE(cursor.selectNode(UserAdministration));
    const std::string path = cursor.getPathToNode();
    EXPECT_TRUE(cursor.selectNode(UserAccount));
    EXPECT_TRUE(cursor.setFilter(ParentPath, path));
    EXPECT_EQ(cursor.getNodeSize(), 2U);
    EXPECT_EQ(numberOf(cursor, AccountState), 1U);
    ++cursor;
    EXPECT_EQ(numberOf(cursor, AccountState), 16U);
    ++cursor;
    EXPECT_FALSE(cursor);
    ++cursor;
    EXPECT_FALSE(cursor);
    EXPECT_EQ(cursor.getNodeSize(), 2U);
}

TEST_F(InstrumentationCursor, An_unknown_path_kind_keeps_nothing) {
    Instrumentation cursor;
    cursor.selectNode(UserAccount);
    EXPECT_FALSE(cursor.setFilter(static_cast<PathType>(2), "/UserAdministration/1"));
    EXPECT_FALSE(cursor);
    EXPECT_EQ(cursor.getNodeSize(), 0U);
}

TEST_F(InstrumentationCursor, The_printable_path_of_a_service_root_stays_the_same) {
    Instrumentation cursor;
    cursor.selectNode(AccountServiceRoot);
    const std::string text = cursor.convertPathToString(cursor.getPathToNode());
    EXPECT_EQ(text, "/AccountServiceRoot/1");
    Instrumentation other;
    other.selectNode(AccountServiceRoot);
    EXPECT_EQ(other.convertPathToString(other.getPathToNode()), text);
    EXPECT_EQ(other.convertPathToString("a\nb"), "a%0Ab");
}

TEST_F(InstrumentationCursor, An_account_added_by_another_program_is_in_the_next_listing) {
    EXPECT_THAT(accountsNow(), ElementsAre("alice", "bob"));
    root.append("etc/passwd", "carol:x:3:3:::\n");
    refreshIfCountsDiffer();
    EXPECT_THAT(accountsNow(), ElementsAre("alice", "bob", "carol"));
    root.replace("etc/passwd", "carol:x:3:3:::\n");
    refreshIfCountsDiffer();
    EXPECT_THAT(accountsNow(), ElementsAre("carol"));
}

TEST_F(InstrumentationCursor, A_change_in_place_of_the_same_size_is_in_the_next_listing) {
    for (int i = 0; i < 50; ++i) {
        const std::string name = "user" + std::to_string(10 + i);
        root.write("etc/passwd", name + ":x:1:1:::\n");
        ASSERT_THAT(accountsNow(), ElementsAre(name));
    }
}

TEST_F(InstrumentationCursor, Equal_counts_ask_for_no_refresh) {
    accountsNow();
    EXPECT_FALSE(refreshIfCountsDiffer());
}

TEST_F(InstrumentationCursor, Counts_differ_when_the_file_changes_after_the_selection) {
    Instrumentation cursor;
    cursor.selectNode(UserAccount);
    root.append("etc/passwd", "carol:x:3:3:::\n");
    EXPECT_EQ(numberOf(cursor, EntryCount), 3U);
    EXPECT_EQ(cursor.getNodeSize(), 2U);
}

TEST_F(InstrumentationCursor, Each_new_cursor_follows_the_environment) {
    const ScratchRoot other;
    other.write("etc/passwd", "dora:x:1:1:::\n");
    Instrumentation before;
    EXPECT_THAT(accountsNow(), ElementsAre("alice", "bob"));
    {
        const ScopedVariable changed("QELO_NODE_STORE", other.choice());
        EXPECT_THAT(accountsNow(), ElementsAre("dora"));
        EXPECT_TRUE(before.selectNode(UserAccount));
        EXPECT_EQ(before.getNodeSize(), 2U);
    }
}

TEST_F(InstrumentationCursor, A_node_file_can_be_chosen) {
    const auto file = root.write("n.json", R"({"nodes":[{"type":46,"path":"/x",
                                               "properties":{"108":"from file"}}]})");
    const ScopedVariable changed("QELO_NODE_STORE", "file:" + file.string());
    EXPECT_THAT(accountsNow(), ElementsAre("from file"));
}

TEST_F(InstrumentationCursor, Malformed_choices_are_errors_and_logged_once) {
    for (const char* value : {"accounts", "accounts:", "file:", "file", "json:/x", ":", "/etc",
                              "ACCOUNTS:/", " accounts:/", "accounts;/", "x\ny"}) {
        clearLog();
        const ScopedVariable changed("QELO_NODE_STORE", value);
        for (int request = 0; request < 3; ++request) {
            EXPECT_THAT(errorOf([] { accountsNow(); }),
                        HasSubstr("is neither accounts:DIR nor file:PATH"));
        }
        ASSERT_EQ(loggedTexts().size(), 1U);
        EXPECT_THAT(loggedTexts()[0], HasSubstr("QELO_NODE_STORE"));
        EXPECT_EQ(loggedTexts()[0].find('\n'), std::string::npos);
    }
}

TEST_F(InstrumentationCursor, Unset_and_empty_mean_the_accounts_of_this_machine) {
    const ScopedVariable empty("QELO_NODE_STORE", "");
    const auto withEmpty = accountsNow();
    ::unsetenv("QELO_NODE_STORE");
    EXPECT_THAT(accountsNow(), withEmpty);
    EXPECT_EQ(withEmpty, namesOf(makeStore("accounts:/", systemFiles()), UserAccount));
}

TEST_F(InstrumentationCursor, Stores_of_the_same_choice_are_one_until_many_others_are_used) {
    const auto first = chosenStore();
    EXPECT_EQ(chosenStore(), first);
    for (int i = 0; i < 40; ++i) {
        const ScopedVariable changed("QELO_NODE_STORE", "accounts:/none" + std::to_string(i));
        chosenStore();
    }
    ::setenv("QELO_NODE_STORE", root.choice().c_str(), 1);
    EXPECT_NE(chosenStore(), first);
    EXPECT_THAT(accountsNow(), ElementsAre("alice", "bob"));
}

TEST_F(InstrumentationCursor, A_refused_command_changes_nothing) {
    Instrumentation cursor;
    cursor.selectNode(UserAdministration);
    std::string command = "NoSuchMethod";
    std::string status = "kept";
    EXPECT_FALSE(cursor.setProperty(AdminCommand, command));
    EXPECT_FALSE(cursor.getProperty(AdminCommand, status));
    EXPECT_EQ(status, "kept");
    EXPECT_EQ(command, "NoSuchMethod");
    EXPECT_THAT(accountsNow(), ElementsAre("alice", "bob"));
}

#ifdef QELO_WITH_COMMANDS
TEST_F(InstrumentationCursor, An_accepted_command_is_in_the_next_listing) {
    if (::geteuid() != 0) {
        GTEST_SKIP() << "only root may change an account database";
    }
    root.write("etc/gshadow", "staff:!::alice\n");
    Instrumentation cursor;
    cursor.selectNode(UserAdministration);
    std::string command = "DisableUser,Name:CMPI_string:alice";
    std::string status;
    ASSERT_TRUE(cursor.setProperty(AdminCommand, command)) << loggedTexts().back();
    EXPECT_TRUE(cursor.getProperty(AdminCommand, status));
    EXPECT_NE(status, "");
    EXPECT_EQ(accountNumber(chosenStore(), "alice", AccountState), 16U);
    EXPECT_EQ(command, "DisableUser,Name:CMPI_string:alice");
}
#endif

} // namespace qelo::nodes::tests
