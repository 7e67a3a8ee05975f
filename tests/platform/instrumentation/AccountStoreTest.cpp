#include "FakeFiles.h"
#include "StoreListing.h"
#include "TestLog.h"

#include <gmock/gmock.h>

#include <cerrno>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr int everyProperty = 400;

class AccountStore : public testing::Test {
protected:
    AccountStore() {
        clearLog();
        root.write("etc/passwd", "root:x:0:0:root:/root:/bin/bash\n"
                                 "alice:x:1000:1001:Alice Liddell,Room 1,555:/home/alice:/bin/zsh\n"
                                 "daemon:x:1:1::/usr/sbin:\n");
        root.write("etc/shadow", "root:$6$salt$rootsecret:19000:0:99999:7:::\n"
                                 "alice:$y$j9T$salt$alicesecret:19782:2:90:14:30:40000:\n"
                                 "daemon:*:0:0:::::\n");
        root.write("etc/group", "root:x:0:\n"
                                "staff:grouphash:50:alice,root,bob\n");
    }

    std::optional<std::string> text(const char* name, int id) {
        return accountText(storeOf(root), name, id);
    }
    std::optional<unsigned int> number(const char* name, int id) {
        return accountNumber(storeOf(root), name, id);
    }

    ScratchRoot root;
};

// Every text that a node serves, whatever property it is.
std::string allTexts(const NodeCursor& cursor) {
    std::string all = cursor.path();
    for (int id = 0; id < everyProperty; ++id) {
        std::string text;
        std::vector<std::string> list;
        cursor.read(id, text);
        cursor.read(id, list);
        all += text;
        for (const std::string& element : list) {
            all += element;
        }
    }
    return all;
}

} // namespace

TEST_F(AccountStore, Accounts_and_groups_come_in_the_order_of_their_files) {
    EXPECT_THAT(namesOf(storeOf(root), UserAccount), ElementsAre("root", "alice", "daemon"));
    EXPECT_THAT(namesOf(storeOf(root), UserGroup), ElementsAre("root", "staff"));
    EXPECT_THAT(loggedTexts(), IsEmpty());
}

TEST_F(AccountStore, The_fields_of_an_account_are_its_properties) {
    EXPECT_EQ(text("alice", UserID), "1000");
    EXPECT_EQ(text("alice", GroupId), "1001");
    EXPECT_EQ(text("alice", FullName), "Alice Liddell");
    EXPECT_EQ(text("alice", HomeDirectory), "/home/alice");
    EXPECT_EQ(text("alice", ScriptPath), "/bin/zsh");
}

TEST_F(AccountStore, The_shadow_fields_of_an_account_are_its_properties) {
    EXPECT_EQ(text("alice", PasswordLastChanged), "2024-02-29 00:00:00");
    EXPECT_EQ(number("alice", PasswordDaysMustKeep), 2U);
    EXPECT_EQ(number("alice", DaysMustChangePasswordAfter), 90U);
    EXPECT_EQ(number("alice", PasswordDaysWarnBeforeExpire), 14U);
    EXPECT_EQ(number("alice", DaysExpireAfter), 30U);
    EXPECT_EQ(text("alice", PasswordExpiration), "2079-07-08 00:00:00");
    EXPECT_EQ(number("alice", AccountState), 1U);
    EXPECT_EQ(number("daemon", AccountState), 16U);
}

TEST_F(AccountStore, What_the_files_do_not_tell_is_no_property) {
    for (const int id : {FullName, ScriptPath, PasswordExpiration, PasswordLastChanged,
                         OrganizationName, InactivityTimeout, UserPassword}) {
        EXPECT_EQ(text("daemon", id), std::nullopt) << id;
    }
    for (const int id : {DaysMustChangePasswordAfter, PasswordDaysWarnBeforeExpire, DaysExpireAfter,
                         MaxLoginFailures, PasswordHistoryDepth}) {
        EXPECT_EQ(number("daemon", id), std::nullopt) << id;
    }
    EXPECT_EQ(number("daemon", PasswordDaysMustKeep), 0U);
}

TEST_F(AccountStore, No_property_holds_a_password_or_hash) {
    const auto store = storeOf(root);
    for (const int type : {UserAdministration, AccountServiceRoot, UserAccount, UserGroup}) {
        NodeCursor cursor(store);
        for (cursor.select(type); cursor.valid(); cursor.advance()) {
            for (const char* secret : {"secret", "salt", "grouphash", "$6$"}) {
                EXPECT_EQ(allTexts(cursor).find(secret), std::string::npos) << secret;
            }
        }
    }
}

TEST_F(AccountStore, A_group_has_name_number_and_members_in_their_order) {
    const NodeCursor staff = cursorOn(storeOf(root), UserGroup, "staff");
    std::vector<std::string> members;
    std::string number;
    EXPECT_TRUE(staff.read(GroupMembers, members));
    EXPECT_TRUE(staff.read(GroupId, number));
    EXPECT_THAT(members, ElementsAre("alice", "root", "bob"));
    EXPECT_EQ(number, "50");
}

TEST_F(AccountStore, A_group_without_members_has_an_empty_list) {
    std::vector<std::string> members = {"left over"};
    EXPECT_TRUE(cursorOn(storeOf(root), UserGroup, "root").read(GroupMembers, members));
    EXPECT_THAT(members, IsEmpty());
}

TEST_F(AccountStore, Accounts_and_groups_lie_under_the_one_administration_node) {
    NodeCursor cursor(storeOf(root));
    ASSERT_TRUE(cursor.select(UserAdministration));
    EXPECT_EQ(cursor.size(), 1U);
    const std::string administration = cursor.path();
    EXPECT_EQ(administration, "/UserAdministration/1");
    for (const int type : {UserAccount, UserGroup}) {
        cursor.select(type);
        const unsigned int all = cursor.size();
        EXPECT_TRUE(cursor.keepUnder(administration));
        EXPECT_EQ(cursor.size(), all);
    }
    EXPECT_TRUE(cursor.select(AccountServiceRoot));
    EXPECT_EQ(cursor.path(), "/AccountServiceRoot/1");
    EXPECT_EQ(cursor.size(), 1U);
    EXPECT_FALSE(cursor.keepUnder(administration));
}

TEST_F(AccountStore, Paths_are_encoded_where_names_need_it) {
    root.append("etc/passwd", "a/b c:x:5:5:::\npc$:x:6:6:::\n");
    EXPECT_EQ(cursorOn(storeOf(root), UserAccount, "a/b c").path(),
              "/UserAdministration/1/UserAccount/a%2Fb%20c");
    EXPECT_EQ(cursorOn(storeOf(root), UserAccount, "pc$").path(),
              "/UserAdministration/1/UserAccount/pc%24");
}

TEST_F(AccountStore, Without_a_shadow_file_only_the_account_file_tells) {
    std::filesystem::remove(root.path() / "etc/shadow");
    root.append("etc/passwd", "old:$6$inline:7:7:::\ngone:*:8:8:::\n");
    EXPECT_EQ(number("alice", AccountState), std::nullopt);
    EXPECT_EQ(text("alice", PasswordLastChanged), std::nullopt);
    EXPECT_EQ(text("alice", ScriptPath), "/bin/zsh");
    EXPECT_EQ(number("old", AccountState), 1U);
    EXPECT_EQ(number("gone", AccountState), 16U);
}

TEST_F(AccountStore, A_missing_shadow_file_is_reported_once) {
    std::filesystem::remove(root.path() / "etc/shadow");
    const auto store = storeOf(root);
    for (int request = 0; request < 5; ++request) {
        namesOf(store, UserAccount);
    }
    ASSERT_EQ(loggedLines().size(), 1U);
    EXPECT_THAT(loggedLines()[0].text, HasSubstr("etc/shadow: cannot be read: No such file"));
    EXPECT_EQ(loggedLines()[0].component, "Qelo.NodeStore");
    EXPECT_EQ(loggedLines()[0].level, 6000);
}

TEST_F(AccountStore, A_missing_account_file_is_an_error_and_the_groups_are_served) {
    std::filesystem::remove(root.path() / "etc/passwd");
    const auto store = storeOf(root);
    EXPECT_THAT(errorOf([&] { namesOf(store, UserAccount); }),
                HasSubstr("etc/passwd cannot be read: No such file"));
    EXPECT_THAT(namesOf(store, UserGroup), ElementsAre("root", "staff"));
    EXPECT_THAT(namesOf(store, UserAdministration).size(), 1U);
    EXPECT_THAT(loggedTexts(), ElementsAre(HasSubstr("etc/passwd: cannot be read")));
}

TEST_F(AccountStore, A_missing_group_file_is_an_error_and_the_accounts_are_served) {
    std::filesystem::remove(root.path() / "etc/group");
    const auto store = storeOf(root);
    EXPECT_THAT(errorOf([&] { namesOf(store, UserGroup); }), HasSubstr("etc/group"));
    EXPECT_EQ(namesOf(store, UserAccount).size(), 3U);
}

TEST_F(AccountStore, An_empty_account_file_is_an_empty_system) {
    root.write("etc/passwd", "");
    NodeCursor cursor(storeOf(root));
    EXPECT_FALSE(cursor.select(UserAccount));
    EXPECT_FALSE(cursor.valid());
    EXPECT_EQ(cursor.size(), 0U);
}

TEST_F(AccountStore, Everything_fails_below_a_root_that_is_no_directory) {
    for (const std::string& bad : {std::string("/nowhere"), std::string("/etc/passwd")}) {
        const auto store = makeStore("accounts:" + root.path().string() + bad, systemFiles());
        for (const int type : {UserAdministration, AccountServiceRoot, UserAccount, UserGroup}) {
            EXPECT_THAT(errorOf([&] { namesOf(store, type); }), HasSubstr("cannot be read"));
        }
    }
    EXPECT_EQ(loggedLines().size(), 2U);
}

TEST_F(AccountStore, A_root_that_comes_later_is_served) {
    const auto late = makeStore("accounts:" + (root.path() / "late").string(), systemFiles());
    EXPECT_NE(errorOf([&] { namesOf(late, UserAccount); }), "");
    root.write("late/etc/passwd", "bob:x:1:1:::\n");
    EXPECT_THAT(namesOf(late, UserAccount), ElementsAre("bob"));
}

TEST_F(AccountStore, The_files_may_be_links) {
    std::filesystem::rename(root.path() / "etc/passwd", root.path() / "etc/real");
    std::filesystem::create_symlink("real", root.path() / "etc/passwd");
    EXPECT_EQ(namesOf(storeOf(root), UserAccount).size(), 3U);
}

TEST(AccountFaults, Files_that_may_not_be_read_are_told_apart) {
    struct Case {
        const char* file;
        bool accounts, groups, states;
    };
    for (const Case& fault :
         {Case{"/r/etc/passwd", false, true, false}, Case{"/r/etc/shadow", true, true, false},
          Case{"/r/etc/group", true, false, true}}) {
        for (const int error : {EACCES, EIO, EMFILE, EFBIG, EINVAL}) {
            SCOPED_TRACE(std::string(fault.file) + " " + std::to_string(error));
            clearLog();
            FakeFiles files;
            files.failRead(fault.file, error);
            const auto store = makeStore("accounts:/r", files);
            EXPECT_EQ(errorOf([&] { namesOf(store, UserAccount); }).empty(), fault.accounts);
            EXPECT_EQ(errorOf([&] { namesOf(store, UserGroup); }).empty(), fault.groups);
            if (fault.accounts) {
                EXPECT_EQ(accountNumber(store, "alice", AccountState).has_value(), fault.states);
            }
            EXPECT_THAT(loggedTexts(), ElementsAre(HasSubstr(fault.file)));
        }
    }
}

TEST(AccountFaults, A_policy_file_that_may_not_be_read_only_costs_its_settings) {
    for (const char* name : {"/r/etc/security/faillock.conf", "/r/etc/security/pwhistory.conf",
                             "/r/etc/security/pwquality.conf", "/r/etc/pam.d/common-password"}) {
        clearLog();
        FakeFiles files;
        files.put(name, "deny = 4\n");
        files.failRead(name, EACCES);
        const auto store = makeStore("accounts:/r", files);
        EXPECT_THAT(namesOf(store, UserAccount), ElementsAre("alice"));
        EXPECT_EQ(accountNumber(store, "alice", MaxLoginFailures), std::nullopt);
        EXPECT_THAT(loggedTexts(), ElementsAre(HasSubstr(name)));
    }
}

} // namespace qelo::nodes::tests
