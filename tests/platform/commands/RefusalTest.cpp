// What commands refuse, with everything left as it was.
#include "CommandLog.h"
#include "CommandTest.h"

#include <sys/stat.h>
#include <unistd.h>

namespace qelo::test {

namespace {

namespace fs = std::filesystem;

using testing::AllOf;
using testing::HasSubstr;

class Refusal : public CommandTest {
protected:
    void addAccountLine(const std::string& passwdLine, const std::string& shadowLine) {
        write(etc("passwd"), contentOf(etc("passwd")) + passwdLine + "\n");
        write(etc("shadow"), contentOf(etc("shadow")) + shadowLine + "\n");
    }
};

} // namespace

TEST_F(Refusal, The_superuser_is_neither_deleted_nor_disabled_nor_renumbered) {
    refuse("DeleteUser", {text("Name", "root")});
    refuse("DeleteUser", {text("Name", "root"), number("RemoveHome", 1)});
    refuse("DisableUser", {text("Name", "root")});
    refuse("ModifyUser", {text("Name", "root"), number("UserID", 5)});
    refuse("ModifyUser", {text("Name", "root"), number("GroupId", 100)});
    refuse("ModifyUser", {text("Name", "root"), text("ScriptPath", "/usr/sbin/nologin")});
    refuse("ModifyUser", {text("Name", "root"), number("daysExpireAfter", 0)});
    refuse("ModifyUser", {text("Name", "root"), number("daysMustChangePasswordAfter", 0)});
    refuse("ModifyUser",
           {text("Name", "root"), dateTime("PasswordExpiration", "19700102000000.000000+000")});
    refuse("CreateUser", {text("Name", "zero"), number("UserID", 0)});
    refuse("ModifyUser", {text("Name", "nobody"), number("UserID", 0)});
}

TEST_F(Refusal, Every_account_with_number_0_is_a_superuser) {
    for (const char* id : {"0", "00", "000000"}) {
        const std::string name = "toor" + std::to_string(std::string(id).size());
        addAccountLine(name + ":x:" + id + ":0::/root:/bin/sh", name + ":*:19000::::::");
        refuse("DeleteUser", {text("Name", name)});
        refuse("DisableUser", {text("Name", name)});
        refuse("ModifyUser", {text("Name", name), number("UserID", 5)});
    }
    expectFaults();
}

TEST_F(Refusal, The_superuser_can_be_given_a_name_and_a_password) {
    accept("ModifyUser", {text("Name", "root"), text("FullName", "Boss")});
    accept("SetPassword", {text("Name", "root"), text("UserPassword", "pw")});
    EXPECT_EQ("Boss", passwd("root").at(4));
    EXPECT_EQ('$', shadow("root").at(1).front());
}

TEST_F(Refusal, Accounts_that_do_not_exist) {
    for (const char* method : {"ModifyUser", "DeleteUser", "EnableUser", "DisableUser"}) {
        EXPECT_THAT(refuse(method, {text("Name", "none")}), HasSubstr("no such account"));
    }
    refuse("SetPassword", {text("Name", "none"), text("UserPassword", "pw")});
}

TEST_F(Refusal, Names_and_numbers_that_are_in_use) {
    accept("CreateUser", {text("Name", "alice"), number("UserID", 1500)});
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("exists"));
    EXPECT_THAT(refuse("CreateUser", {text("Name", "bob"), number("UserID", 1500)}),
                HasSubstr("UserID is in use"));
    EXPECT_THAT(refuse("ModifyUser", {text("Name", "nobody"), number("UserID", 1500)}),
                HasSubstr("UserID is in use"));
    accept("ModifyUser", {text("Name", "alice"), number("UserID", 1500)});
    // useradd makes a group of the account's name, so there must be none.
    EXPECT_THAT(refuse("CreateUser", {text("Name", "users")}), HasSubstr("users"));
}

TEST_F(Refusal, Groups_that_do_not_exist) {
    EXPECT_THAT(refuse("CreateUser", {text("Name", "bob"), number("GroupId", 4711)}),
                HasSubstr("no group"));
    EXPECT_THAT(refuse("ModifyUser", {text("Name", "nobody"), number("GroupId", 4711)}),
                HasSubstr("no group"));
}

TEST_F(Refusal, Entries_of_a_name_service_and_comments_are_no_accounts) {
    for (const char* name : {"-x", "+x", "#x", "--root"}) {
        addAccountLine(std::string(name) + ":x:900:100::/h:/bin/sh",
                       std::string(name) + ":$y$h:19000::::::");
        for (const char* method : {"ModifyUser", "DeleteUser", "EnableUser", "DisableUser"}) {
            EXPECT_THAT(refuse(method, {text("Name", name)}), HasSubstr("no such account"));
        }
    }
    expectFaults();
}

TEST_F(Refusal, Accounts_whose_lines_are_not_clear) {
    addAccountLine("twice:x:901:100::/h:/bin/sh", "twice:*:19000::::::");
    addAccountLine("twice:x:902:100::/h:/bin/sh", "once:*:19000::::::");
    addAccountLine("short:x:903:100", "short:*:19000::::::");
    addAccountLine("bare:x:904:100::/h:/bin/sh", "");
    addAccountLine("twins:x:905:100::/h:/bin/sh", "twins:*:19000::::::\ntwins:!:19000::::::");
    addAccountLine("alpha:x:minus:100::/h:/bin/sh", "alpha:*:19000::::::");
    addAccountLine("wrap:x:4294967296:100::/h:/bin/sh", "wrap:*:19000::::::");
    addAccountLine("thin:x:906:100::/h:/bin/sh", "thin:*");
    expectFaults();
    for (const char* name : {"twice", "short", "bare", "twins", "alpha", "wrap", "thin"}) {
        for (const char* method : {"DeleteUser", "EnableUser", "DisableUser"}) {
            refuse(method, {text("Name", name)});
        }
        refuse("SetPassword", {text("Name", name), text("UserPassword", "pw")});
        refuse("ModifyUser", {text("Name", name), text("FullName", "F")});
    }
    refuse("CreateUser", {text("Name", "once")});
}

TEST_F(Refusal, Accounts_that_the_system_reads_otherwise_than_its_tools) {
    using namespace std::string_literals;
    addAccountLine(" led:x:901:100::/other:/bin/sh\nled:x:902:100::/h:/bin/sh",
                   "led:*:19000::::::");
    addAccountLine("\tonly:x:903:100::/h:/bin/sh", "only:*:19000::::::");
    addAccountLine("cut:x:904:100::/home\0/h:/bin/sh"s, "cut:*:19000::::::");
    addAccountLine("dark:x:905:100::/h:/bin/sh", "dark:*\0:19000::::::"s);
    addAccountLine("nobodys:x:4294967295:100::/h:/bin/sh", "nobodys:*:19000::::::");
    addAccountLine("ungrouped:x:906:4294967295::/h:/bin/sh", "ungrouped:*:19000::::::");
    expectFaults();
    for (const char* name : {"led", "only", "cut", "dark", "nobodys", "ungrouped"}) {
        for (const char* method : {"DeleteUser", "EnableUser", "DisableUser"}) {
            refuse(method, {text("Name", name)});
        }
        refuse("SetPassword", {text("Name", name), text("UserPassword", "pw")});
        refuse("CreateUser", {text("Name", name)});
    }
    refuse("DeleteUser", {text("Name", "\tonly")});
}

TEST_F(Refusal, Commands_that_may_have_been_cut) {
    const std::string start =
        command("CreateUser", {text("Name", "alice"), "FullName:CMPI_string:"});
    const auto before = stateOf(root());
    for (const std::size_t length : {1023u, 1024u, 5000u, 1u << 20u}) {
        const std::string line = start + std::string(length - start.size(), 'x');
        EXPECT_FALSE(store::executeAdminCommand(root(), line).accepted);
    }
    EXPECT_EQ(before, stateOf(root()));
}

TEST_F(Refusal, Roots_that_are_missing_or_incomplete) {
    const std::string line = command("CreateUser", {text("Name", "alice")});
    EXPECT_FALSE(store::executeAdminCommand(root() / "none", line).accepted);
    EXPECT_FALSE(store::executeAdminCommand("", line).accepted);
    EXPECT_FALSE(store::executeAdminCommand(std::string("/\0x", 3), line).accepted);
    EXPECT_FALSE(store::executeAdminCommand(etc("passwd"), line).accepted);
    fs::remove(etc("shadow"));
    expectFaults();
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("etc/shadow"));
}

TEST_F(Refusal, Account_files_that_lead_elsewhere) {
    const ScratchDirectory elsewhere;
    for (const char* name : {"passwd", "shadow", "group", "gshadow", "subuid"}) {
        fs::rename(etc(name), elsewhere.path() / name);
        fs::create_symlink(elsewhere.path() / name, etc(name));
        EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("not a plain file"));
        fs::remove(etc(name));
        fs::rename(elsewhere.path() / name, etc(name));
    }
    fs::rename(root() / "etc", elsewhere.path() / "etc");
    fs::create_symlink(elsewhere.path() / "etc", root() / "etc");
    EXPECT_FALSE(run("CreateUser", {text("Name", "alice")}).accepted);
    EXPECT_TRUE(lineOf(elsewhere.path() / "etc/passwd", "alice").empty());
    fs::remove(root() / "etc");
    fs::rename(elsewhere.path() / "etc", root() / "etc");
}

TEST_F(Refusal, Roots_that_others_can_write_to) {
    ::chmod(root().c_str(), 0777);
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("written by all"));
    ::chmod(root().c_str(), 0755);
    ::chmod((root() / "etc").c_str(), 0757);
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("written by all"));
    ::chmod((root() / "etc").c_str(), 0755);
    accept("CreateUser", {text("Name", "alice")});
}

TEST_F(Refusal, Roots_of_other_users) {
    if (!isSuperuser()) {
        GTEST_SKIP() << "only the superuser can give a directory away";
    }
    ASSERT_EQ(0, ::chown((root() / "etc").c_str(), 12345, 12345));
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("another user"));
}

TEST_F(Refusal, Roots_that_may_not_be_written) {
    if (isSuperuser()) {
        GTEST_SKIP() << "the superuser may write everywhere";
    }
    ::chmod((root() / "etc").c_str(), 0555);
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("no permission"));
    ::chmod((root() / "etc").c_str(), 0755);
}

TEST_F(Refusal, Is_logged_with_its_reason_in_both_sinks) {
    takeLogLines();
    const std::string reason = refuse("DeleteUser", {text("Name", "none")});
    const std::vector<LogLine> lines = takeLogLines();
    ASSERT_EQ(2u, lines.size());
    for (const LogLine& line : lines) {
        EXPECT_EQ("Qelo.AdminCommand", line.component);
        EXPECT_EQ(6000, line.level);
        EXPECT_THAT(line.message, AllOf(HasSubstr("DeleteUser"), HasSubstr(reason)));
    }
    accept("CreateUser", {text("Name", "alice")});
    EXPECT_TRUE(takeLogLines().empty());
}

} // namespace qelo::test
