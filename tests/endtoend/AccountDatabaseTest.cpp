#include "Qelosim.h"

namespace qelo::endtoend {
namespace {

TEST_F(AccountDatabase, Accounts_are_the_lines_of_passwd_with_their_state) {
    const Finished finished = run({"accounts"});
    EXPECT_EQ(finished.status, 0);
    EXPECT_EQ(finished.err, "");
    EXPECT_EQ(finished.out,
              "NAME     UID   GID  STATE     FULL NAME      HOME          SHELL\n"
              "alice   1000  1000  disabled  Alice Example  /home/alice   /bin/bash\n"
              "daemon     1     1  disabled  daemon         /usr/sbin     /usr/sbin/nologin\n"
              "hanako  1001  1001  expired   山田 花子      /home/hanako  /bin/zsh\n"
              "root       0     0  enabled   root           /root         /bin/bash\n"
              "\n"
              "4 accounts (2 disabled, 1 enabled, 1 expired)\n");
}

TEST_F(AccountDatabase, Accounts_as_json_have_typed_properties) {
    const auto accounts = json({"accounts"});
    ASSERT_EQ(accounts.size(), 4U);
    const auto& alice = accounts[0]["properties"];
    EXPECT_EQ(accounts[0]["class"], "ZANTH_Account");
    EXPECT_EQ(alice["Name"], "alice");
    EXPECT_EQ(alice["UserID"], "1000");
    EXPECT_EQ(alice["GroupId"], 1000);
    EXPECT_EQ(alice["EnabledState"], 3);
    EXPECT_EQ(alice["AccountDisable"], true);
    EXPECT_EQ(alice["Description"], "Alice Example");
    EXPECT_EQ(alice["FullName"], "");
    EXPECT_EQ(alice["HomeDirectory"], "/home/alice");
    EXPECT_EQ(alice["ScriptPath"], "/bin/bash");
    EXPECT_EQ(alice["daysMustChangePasswordAfter"], 99999);
    EXPECT_EQ(alice["passwordLastChanged"], "20220108000000.000000+000");
}

TEST_F(AccountDatabase, No_password_hash_appears_in_any_output) {
    for (const char* className : {"ZANTH_Account", "ZANTH_Group", "ZANTH_SimIdentity"}) {
        for (const char* format : {"text", "json", "mof"}) {
            const Finished finished = run({"ei", className, "--format", format});
            EXPECT_EQ(finished.status, 0) << finished.err;
            EXPECT_EQ(finished.out.find("$6$"), std::string::npos);
        }
    }
}

TEST_F(AccountDatabase, Groups_are_the_lines_of_group_with_their_members) {
    const Finished finished = run({"groups"});
    EXPECT_EQ(finished.status, 0) << finished.err;
    EXPECT_EQ(finished.out, "NAME     GID  SIZE  MEMBERS\n"
                            "adm        4     2  root, alice\n"
                            "alice   1000     0\n"
                            "hanako  1001     0\n"
                            "root       0     0\n"
                            "\n"
                            "4 groups\n");
}

TEST_F(AccountDatabase, A_group_of_50000_members_is_served_whole) {
    constexpr int members = 50000;
    std::string joined;
    for (int i = 0; i < members; ++i) {
        joined += (i == 0 ? "member" : ",member") + std::to_string(i);
    }
    scratch.write("etc/group", "crowd:x:900:" + joined + "\n");
    const auto groups = json({"groups"});
    ASSERT_EQ(groups.size(), 1U);
    EXPECT_EQ(groups[0]["properties"]["GroupMembers"], joined);
}

TEST_F(AccountDatabase, A_change_on_disk_is_seen_by_the_next_command) {
    EXPECT_EQ(json({"accounts"}).size(), 4U);
    scratch.write("etc/passwd", "root:x:0:0:root:/root:/bin/bash\n");
    EXPECT_EQ(json({"accounts"}).size(), 1U);
}

TEST_F(AccountDatabase, Hostile_fields_reach_the_output_escaped) {
    scratch.write("etc/passwd", "eve:x:0:0:\x1b]0;owned\x07\x1b[2J\xff\xc2\x9b:/home/e:/bin/sh\n");
    for (const char* format : {"text", "json", "mof"}) {
        const Finished finished = run({"accounts", "--format", format});
        EXPECT_EQ(finished.status, 0) << finished.err;
        EXPECT_NE(finished.out.find("eve"), std::string::npos);
        EXPECT_EQ(finished.out.find_first_of("\x1b\x07\xff"), std::string::npos) << finished.out;
        EXPECT_EQ(finished.out.find("\xc2\x9b"), std::string::npos);
    }
}

} // namespace
} // namespace qelo::endtoend
