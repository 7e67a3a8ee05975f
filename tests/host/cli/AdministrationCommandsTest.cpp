#include "Program.h"
#include "StandardInput.h"

namespace qelo::cli {
namespace {

using cim::Type;
using cim::Value;
using Texts = std::vector<std::string>;

class AdministrationCommands : public Program {
protected:
    // The argument of the last call; null where it has none of this name.
    const Value* argument(const std::string& name) const {
        for (const auto& [key, value] : manager.arguments) {
            if (key == name) {
                return &value;
            }
        }
        return nullptr;
    }

    void expectArgument(const std::string& name, const Value& expected) const {
        ASSERT_NE(argument(name), nullptr) << name;
        EXPECT_EQ(*argument(name), expected) << name;
    }
};

Value number(unsigned int value) { return Value::unsignedInteger(Type::UInt32, value); }

TEST_F(AdministrationCommands, Each_command_is_one_method_of_its_class) {
    struct {
        Texts command;
        const char* className;
        const char* method;
        const char* done;
    } const cases[] = {
        {{"create-user", "al"}, "ZANTH_Account", "CreateUser", "created account al\n"},
        {{"modify-user", "al"}, "ZANTH_Account", "ModifyUser", "changed account al\n"},
        {{"delete-user", "al"}, "ZANTH_Account", "DeleteUser", "deleted account al\n"},
        {{"enable-user", "al"}, "ZANTH_Account", "EnableUser", "enabled account al\n"},
        {{"disable-user", "al"}, "ZANTH_Account", "DisableUser", "disabled account al\n"},
        {{"create-group", "crew"}, "ZANTH_Group", "CreateGroup", "created group crew\n"},
        {{"delete-group", "crew"}, "ZANTH_Group", "DeleteGroup", "deleted group crew\n"},
        {{"add-member", "crew", "al"},
         "ZANTH_Group",
         "AddMember",
         "added member to group crew al\n"},
        {{"remove-member", "crew", "al"},
         "ZANTH_Group",
         "RemoveMember",
         "removed member from group crew al\n"},
    };
    std::string done;
    for (const auto& one : cases) {
        EXPECT_EQ(run(one.command), 0) << errors.text();
        EXPECT_EQ(manager.operation, "invokeMethod");
        EXPECT_EQ(manager.path.className(), one.className);
        EXPECT_EQ(manager.path.nameSpace(), "root/cimv2");
        EXPECT_TRUE(manager.path.keys().empty());
        EXPECT_EQ(manager.method, one.method);
        EXPECT_TRUE(options().changes) << one.method;
        client::Arguments expected = {{"Name", Value::string(one.command[1])}};
        if (one.command.size() > 2) {
            expected.emplace_back("Member", Value::string(one.command[2]));
        }
        EXPECT_EQ(manager.arguments, expected) << one.method;
        done += one.done;
    }
    EXPECT_EQ(output.text(), done);
    EXPECT_EQ(errors.text(), "");
}

TEST_F(AdministrationCommands, Options_become_arguments_of_the_types_of_the_method) {
    EXPECT_EQ(run({"modify-user", "al",        "--full-name",   "Al Example",
                   "--uid",       "7",         "--gid",         "4294967295",
                   "--home",      "/h",        "--shell",       "/bin/sh",
                   "--min-days",  "0",         "--max-days",    "90",
                   "--warn-days", "8",         "--create-home", "--inactive-days",
                   "30",          "--expires", "2030-01-02"}),
              0)
        << errors.text();
    expectArgument("FullName", Value::string("Al Example"));
    expectArgument("UserID", number(7));
    expectArgument("GroupId", number(UINT32_MAX));
    expectArgument("HomeDirectory", Value::string("/h"));
    expectArgument("ScriptPath", Value::string("/bin/sh"));
    expectArgument("CreateHome", number(1));
    expectArgument("daysMustKeepPassword", number(0));
    expectArgument("daysMustChangePasswordAfter", number(90));
    expectArgument("daysWarnBeforePasswordExpire", number(8));
    expectArgument("daysExpireAfter", number(30));
    expectArgument("PasswordExpiration",
                   Value::dateTime(*cim::DateTime::parse("20300102000000.000000+000")));
    EXPECT_EQ(manager.arguments.size(), 12U);
    EXPECT_EQ(manager.arguments.front().first, "Name");
}

TEST_F(AdministrationCommands, What_is_not_given_is_no_argument) {
    EXPECT_EQ(run({"create-user", "al", "--gid", "5"}), 0);
    EXPECT_EQ(manager.arguments,
              (client::Arguments{{"Name", Value::string("al")}, {"GroupId", number(5)}}));
    EXPECT_EQ(run({"delete-user", "al", "--remove-home"}), 0);
    EXPECT_EQ(manager.arguments,
              (client::Arguments{{"Name", Value::string("al")}, {"RemoveHome", number(1)}}));
    EXPECT_EQ(run({"create-group", "crew", "--gid", "6"}), 0);
    EXPECT_EQ(manager.arguments,
              (client::Arguments{{"Name", Value::string("crew")}, {"GroupId", number(6)}}));
}

TEST_F(AdministrationCommands, A_text_may_be_empty_and_is_handed_on_as_it_is) {
    EXPECT_EQ(run({"modify-user", "al", "--full-name", "", "--home", " /a b,c:d "}), 0);
    expectArgument("FullName", Value::string(""));
    expectArgument("HomeDirectory", Value::string(" /a b,c:d "));
}

TEST_F(AdministrationCommands, Numbers_that_are_none_are_usage_errors) {
    for (const char* text : {"", "-1", "4294967296", "1x", "0x10", "x", "99999999999999999999"}) {
        EXPECT_EQ(run({"create-user", "al", "--uid=" + std::string(text)}), ExitUsage) << text;
        EXPECT_EQ(run({"create-group", "crew", "--gid=" + std::string(text)}), ExitUsage) << text;
    }
    EXPECT_NE(errors.text().find("qelosim: --uid: not a number from 0 to 4294967295: 1x"
                                 " (see qelosim create-user --help)\n"),
              std::string::npos)
        << errors.text();
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(AdministrationCommands, Days_that_are_none_are_usage_errors) {
    for (const char* text :
         {"", "today", "2030-1-2", "2030-13-01", "2030-02-30", "2030/01/02", "2030-01-02 "}) {
        EXPECT_EQ(run({"modify-user", "al", "--expires=" + std::string(text)}), ExitUsage) << text;
    }
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(AdministrationCommands, Names_must_be_given_and_no_more_than_fit) {
    EXPECT_EQ(run({"create-user"}), ExitUsage);
    EXPECT_EQ(run({"create-user", "a", "b"}), ExitUsage);
    EXPECT_EQ(run({"add-member", "crew"}), ExitUsage);
    EXPECT_EQ(run({"add-member", "crew", "a", "b"}), ExitUsage);
    EXPECT_EQ(run({"delete-user", "a", "--uid", "5"}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(AdministrationCommands, A_password_is_the_first_line_of_standard_input) {
    for (const char* command : {"create-user", "modify-user", "set-password"}) {
        const StandardInput input("open sesame \nsecond line\n");
        EXPECT_EQ(run({command, "al", "--password-stdin"}), 0) << errors.text();
        EXPECT_EQ(manager.arguments,
                  (client::Arguments{{"Name", Value::string("al")},
                                     {"UserPassword", Value::string("open sesame ")}}));
    }
    EXPECT_EQ(output.text().find("sesame"), std::string::npos);
}

TEST_F(AdministrationCommands, Without_a_password_to_set_nothing_is_called) {
    const StandardInput input("\n");
    EXPECT_EQ(run({"set-password", "al", "--password-stdin"}), ExitUsage);
    EXPECT_EQ(errors.text(), "qelosim: no password was given (see qelosim set-password --help)\n");
    EXPECT_EQ(manager.operation, "");
}

TEST_F(AdministrationCommands, A_refusal_is_told_with_its_reason_where_that_is_known) {
    manager.failWith(client::CimError(1, "Execute Method Failed"));
    refusalReason = [] { return std::string("DeleteUser: the name\nis unknown"); };
    EXPECT_EQ(run({"delete-user", "al"}), 1);
    EXPECT_EQ(errors.text(), "qelosim: delete-user: refused or failed, nothing was changed: "
                             "DeleteUser: the name\\nis unknown (CIM_ERR_FAILED, 1)\n");
    EXPECT_EQ(output.text(), "");
}

TEST_F(AdministrationCommands, What_could_not_be_undone_is_told) {
    manager.failWith(client::CimError(1, "Execute Method Failed"));
    refusalReason = [] {
        return std::string("DeleteUser: userdel was killed; not undone: cannot lock etc/passwd");
    };
    EXPECT_EQ(run({"delete-user", "al"}), 1);
    EXPECT_EQ(errors.text(), "qelosim: delete-user: failed, and not all could be put back: "
                             "DeleteUser: userdel was killed; not undone: cannot lock etc/passwd "
                             "(CIM_ERR_FAILED, 1)\n");
}

TEST_F(AdministrationCommands, A_refusal_without_a_known_reason_points_at_the_log) {
    manager.failWith(client::CimError(1, "Execute Method Failed"));
    const std::string expected =
        "qelosim: delete-user: refused or failed, nothing was changed; "
        "an argument holds a comma, a control character or more than 255 bytes, "
        "or the log of the providers says why: Execute Method Failed (CIM_ERR_FAILED, 1)\n";
    EXPECT_EQ(run({"delete-user", "al"}), 1);
    EXPECT_EQ(errors.text(), expected);
    refusalReason = [] { return std::string(); };
    EXPECT_EQ(run({"delete-user", "al"}), 1);
    EXPECT_EQ(errors.text(), expected + expected);
}

TEST_F(AdministrationCommands, Other_errors_keep_their_own_text_and_status) {
    refusalReason = [] { return std::string("an old reason"); };
    manager.failWith(client::CimError(7, "no such provider"));
    EXPECT_EQ(run({"create-group", "crew"}), 7);
    EXPECT_EQ(errors.text(),
              "qelosim: create-group: no such provider (CIM_ERR_NOT_SUPPORTED, 7)\n");
}

TEST_F(AdministrationCommands, What_was_done_is_told_without_control_characters) {
    EXPECT_EQ(run({"create-user", "a\x1b[2J\nb"}), 0);
    EXPECT_EQ(output.text().find('\x1b'), std::string::npos);
    EXPECT_EQ(output.text().find('\n'), output.text().size() - 1);
    expectArgument("Name", Value::string("a\x1b[2J\nb"));
}

} // namespace
} // namespace qelo::cli
