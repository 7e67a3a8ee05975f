// The life of a user, command by command.
#include "CommandTest.h"

#include <crypt.h>
#include <ctime>
#include <sys/stat.h>
#include <unistd.h>

namespace qelo::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// Whether `hash` is the password's, as a login would find out.
bool opens(const std::string& hash, const std::string& password) {
    crypt_data data{};
    const char* result = ::crypt_r(password.c_str(), hash.c_str(), &data);
    return result != nullptr && hash == result;
}

std::string today() { return std::to_string(std::time(nullptr) / 86400); }

class UserLife : public CommandTest {};

} // namespace

TEST_F(UserLife, A_new_user_has_the_given_fields_and_password) {
    accept("CreateUser", {text("Name", "alice"), text("FullName", "Alice Ärmel"),
                          number("UserID", 2345), text("HomeDirectory", "/home/a"),
                          text("ScriptPath", "/bin/sh"), text("UserPassword", "s3cret: pass")});
    EXPECT_THAT(passwd("alice"),
                ElementsAre("alice", "x", "2345", "2345", "Alice Ärmel", "/home/a", "/bin/sh"));
    EXPECT_THAT(shadow("alice"), ElementsAre("alice", testing::StartsWith("$y$"), today(), "0",
                                             "99999", "7", "", "", ""));
    EXPECT_TRUE(opens(shadow("alice")[1], "s3cret: pass"));
    EXPECT_FALSE(opens(shadow("alice")[1], "s3cret"));
    EXPECT_THAT(group("alice"), ElementsAre("alice", "x", "2345", ""));
    EXPECT_FALSE(std::filesystem::exists(root() / "home/a"));
}

TEST_F(UserLife, A_new_user_follows_the_settings_of_the_root) {
    write(etc("login.defs"), "UID_MIN 5000\nUID_MAX 5010\nGID_MIN 6000\nGID_MAX 6010\n"
                             "USERGROUPS_ENAB yes\nPASS_MAX_DAYS 77\n");
    write(etc("default/useradd"), "SHELL=/bin/special\nHOME=/people\n");
    accept("CreateUser", {text("Name", "alice")});
    EXPECT_THAT(passwd("alice"),
                ElementsAre("alice", "x", "5000", "6000", "", "/people/alice", "/bin/special"));
    EXPECT_EQ("77", shadow("alice")[4]);
}

TEST_F(UserLife, A_new_user_without_password_is_locked) {
    accept("CreateUser", {text("Name", "alice")});
    EXPECT_EQ("!", shadow("alice")[1]);
}

TEST_F(UserLife, A_new_user_in_a_given_group_gets_no_group_of_his_own) {
    accept("CreateGroup", {text("Name", "staff"), number("GroupId", 500)});
    accept("CreateUser", {text("Name", "alice"), number("GroupId", 500)});
    EXPECT_EQ("500", passwd("alice")[3]);
    EXPECT_THAT(group("alice"), IsEmpty());
}

TEST_F(UserLife, Disabling_locks_the_password_and_enabling_brings_it_back) {
    accept("CreateUser", {text("Name", "alice"), text("UserPassword", "one")});
    const std::string hash = shadow("alice")[1];
    accept("DisableUser", {text("Name", "alice")});
    EXPECT_EQ("!" + hash, shadow("alice")[1]);
    accept("DisableUser", {text("Name", "alice")});
    EXPECT_EQ("!" + hash, shadow("alice")[1]);
    accept("EnableUser", {text("Name", "alice")});
    EXPECT_EQ(hash, shadow("alice")[1]);
    accept("EnableUser", {text("Name", "alice")});
    EXPECT_EQ(hash, shadow("alice")[1]);
}

TEST_F(UserLife, Enabling_never_leaves_an_empty_password) {
    accept("CreateUser", {text("Name", "alice")});
    EXPECT_THAT(refuse("EnableUser", {text("Name", "alice")}),
                testing::HasSubstr("no password; set one first"));
    accept("SetPassword", {text("Name", "alice"), text("UserPassword", "one")});
    accept("EnableUser", {text("Name", "alice")});
    EXPECT_TRUE(opens(shadow("alice")[1], "one"));
}

TEST_F(UserLife, An_account_with_an_empty_password_can_be_disabled_but_not_enabled) {
    write(etc("passwd"), contentOf(etc("passwd")) + "open:x:900:100::/:/bin/sh\n");
    write(etc("shadow"), contentOf(etc("shadow")) + "open::19000::::::\n");
    refuse("EnableUser", {text("Name", "open")});
    accept("DisableUser", {text("Name", "open")});
    EXPECT_EQ("!", shadow("open")[1]);
    refuse("EnableUser", {text("Name", "open")});
}

TEST_F(UserLife, A_twice_locked_password_is_not_enabled_by_half) {
    write(etc("passwd"), contentOf(etc("passwd")) + "odd:x:900:100::/:/bin/sh\n");
    write(etc("shadow"), contentOf(etc("shadow")) + "odd:!!$y$hash:19000::::::\n");
    refuse("EnableUser", {text("Name", "odd")});
}

TEST_F(UserLife, A_password_set_for_a_disabled_user_waits_until_he_is_enabled) {
    accept("CreateUser", {text("Name", "alice"), text("UserPassword", "one")});
    accept("DisableUser", {text("Name", "alice")});
    accept("SetPassword", {text("Name", "alice"), text("UserPassword", "two")});
    EXPECT_EQ('!', shadow("alice")[1].front());
    accept("EnableUser", {text("Name", "alice")});
    EXPECT_TRUE(opens(shadow("alice")[1], "two"));
}

TEST_F(UserLife, Setting_a_password_renews_the_day_of_its_change) {
    accept("CreateUser", {text("Name", "alice")});
    std::string content = contentOf(etc("shadow"));
    const std::string old = "alice:!:" + today();
    content.replace(content.find(old), old.size(), "alice:!:12345");
    write(etc("shadow"), content);
    accept("SetPassword", {text("Name", "alice"), text("UserPassword", "one")});
    EXPECT_EQ(today(), shadow("alice")[2]);
    EXPECT_TRUE(opens(shadow("alice")[1], "one"));
}

TEST_F(UserLife, Each_field_is_changed_alone) {
    accept("CreateUser", {text("Name", "alice"), text("UserPassword", "one")});
    accept("CreateGroup", {text("Name", "staff"), number("GroupId", 500)});
    std::vector<std::string> fields = passwd("alice");
    const std::vector<std::string> secret = shadow("alice");
    const auto change = [&](const std::string& argument, std::size_t index,
                            const std::string& value) {
        accept("ModifyUser", {text("Name", "alice"), argument});
        fields.at(index) = value;
        EXPECT_EQ(fields, passwd("alice")) << argument;
        EXPECT_EQ(secret, shadow("alice")) << argument;
    };
    change(text("FullName", "A lice"), 4, "A lice");
    change(text("HomeDirectory", "/srv/alice"), 5, "/srv/alice");
    change(text("ScriptPath", "/bin/ksh"), 6, "/bin/ksh");
    change(number("UserID", 4321), 2, "4321");
    change(number("GroupId", 500), 3, "500");
    change(text("FullName", ""), 4, "");
    EXPECT_THAT(group("alice"), ElementsAre("alice", "x", "1000", ""));
}

TEST_F(UserLife, All_fields_are_changed_at_once) {
    accept("CreateUser", {text("Name", "alice")});
    accept("ModifyUser",
           {text("Name", "alice"), text("FullName", "Al"), number("UserID", 4321),
            number("GroupId", 100), text("HomeDirectory", "/srv/alice"),
            text("ScriptPath", "/bin/ksh"), text("UserPassword", "new"),
            number("daysMustKeepPassword", 1), number("daysMustChangePasswordAfter", 90),
            number("daysWarnBeforePasswordExpire", 14), number("daysExpireAfter", 30),
            dateTime("PasswordExpiration", "20300102030405.000000+000")});
    EXPECT_THAT(passwd("alice"),
                ElementsAre("alice", "x", "4321", "100", "Al", "/srv/alice", "/bin/ksh"));
    EXPECT_THAT(shadow("alice"), ElementsAre("alice", testing::StartsWith("$y$"), today(), "1",
                                             "90", "14", "30", "21916", ""));
    EXPECT_TRUE(opens(shadow("alice")[1], "new"));
}

TEST_F(UserLife, Ageing_leaves_the_password_and_what_is_not_named) {
    accept("CreateUser", {text("Name", "alice"), text("UserPassword", "one")});
    std::vector<std::string> fields = shadow("alice");
    accept("ModifyUser", {text("Name", "alice"), number("daysMustChangePasswordAfter", 0)});
    fields[4] = "0";
    EXPECT_EQ(fields, shadow("alice"));
    accept("ModifyUser", {text("Name", "alice"), number("daysExpireAfter", 2147483647)});
    fields[6] = "2147483647";
    EXPECT_EQ(fields, shadow("alice"));
}

TEST_F(UserLife, A_change_of_nothing_runs_no_tool) {
    accept("CreateUser", {text("Name", "alice"), text("UserPassword", "one")});
    const auto before = stateOf(root());
    accept("ModifyUser", {text("Name", "alice")});
    EXPECT_EQ(before, stateOf(root()));
}

TEST_F(UserLife, The_other_fields_of_the_comment_stay) {
    write(etc("passwd"),
          contentOf(etc("passwd")) + "bob:x:900:100:Bob,Room 5,123,456:/home/bob:/bin/sh\n");
    write(etc("shadow"), contentOf(etc("shadow")) + "bob:*:19000::::::\n");
    accept("ModifyUser", {text("Name", "bob"), text("FullName", "Robert")});
    EXPECT_EQ("Robert,Room 5,123,456", passwd("bob")[4]);
}

TEST_F(UserLife, Deleting_takes_the_group_the_memberships_and_the_ranges_along) {
    const auto before = stateOf(root());
    accept("CreateUser", {text("Name", "alice")});
    accept("CreateUser", {text("Name", "bob")});
    accept("AddMember", {text("Name", "users"), text("Member", "alice")});
    EXPECT_THAT(lineOf(etc("subuid"), "alice"), ElementsAre("alice", "100000", "65536"));
    accept("DeleteUser", {text("Name", "alice")});
    EXPECT_THAT(passwd("alice"), IsEmpty());
    EXPECT_THAT(group("alice"), IsEmpty());
    EXPECT_EQ("", group("users")[3]);
    EXPECT_THAT(lineOf(etc("subuid"), "alice"), IsEmpty());
    accept("DeleteUser", {text("Name", "bob")});
    EXPECT_EQ(before, stateOf(root()));
}

TEST_F(UserLife, A_users_own_group_stays_when_another_user_is_in_it) {
    accept("CreateUser", {text("Name", "alice")});
    accept("CreateUser", {text("Name", "bob"), number("GroupId", 1000)});
    accept("DeleteUser", {text("Name", "alice")});
    EXPECT_THAT(group("alice"), ElementsAre("alice", "x", "1000", ""));
}

TEST_F(UserLife, Names_that_could_not_be_created_can_be_changed_and_deleted) {
    const std::vector<std::string> names{"Wild.Name",   "with blank", "12",   "a$", "tick`s`",
                                         "caf\xc3\xa9", "\xff\xfe",   "a;id", "a-", "$(reboot)"};
    for (const std::string& name : names) {
        write(etc("passwd"), contentOf(etc("passwd")) + name + ":x:902:100::/h:/bin/sh\n");
        write(etc("shadow"), contentOf(etc("shadow")) + name + ":$y$h:19000::::::\n");
        accept("DisableUser", {text("Name", name)});
        EXPECT_EQ("!$y$h", shadow(name).at(1)) << name;
        accept("EnableUser", {text("Name", name)});
        accept("SetPassword", {text("Name", name), text("UserPassword", "pw")});
        EXPECT_TRUE(opens(shadow(name).at(1), "pw")) << name;
        accept("ModifyUser",
               {text("Name", name), text("FullName", "Some Body"), number("UserID", 901)});
        EXPECT_EQ("Some Body", passwd(name).at(4)) << name;
        EXPECT_EQ("901", passwd(name).at(2)) << name;
        accept("AddMember", {text("Name", "users"), text("Member", name)});
        EXPECT_EQ(name, group("users").at(3));
        accept("DeleteUser", {text("Name", name)});
        EXPECT_THAT(passwd(name), IsEmpty());
        EXPECT_EQ("", group("users").at(3));
    }
}

} // namespace qelo::test
