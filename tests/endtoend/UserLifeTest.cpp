// The life of accounts and groups on a scratch root directory, through the command line.
#include "Qelosim.h"

#include <crypt.h>
#include <fstream>
#include <regex>
#include <sstream>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

namespace qelo::endtoend {
namespace {

std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

class UserLife : public ::testing::Test {
protected:
    void SetUp() override {
        root = scratch.path("root");
        const Finished made = qelosim({"init-root", root});
        ASSERT_EQ(made.status, 0) << made.err;
        for (const char* name : {"passwd", "shadow", "group", "gshadow", "subuid", "subgid"}) {
            machine.push_back(contentOf(std::string("/etc/") + name));
        }
    }

    void TearDown() override {
        std::size_t i = 0;
        for (const char* name : {"passwd", "shadow", "group", "gshadow", "subuid", "subgid"}) {
            EXPECT_EQ(contentOf(std::string("/etc/") + name), machine[i++]) << name;
        }
    }

    Finished run(std::vector<std::string> arguments) const {
        arguments.insert(arguments.end(), {"--root", root});
        return qelosim(std::move(arguments));
    }

    // Runs a command that reads `password` from its standard input.
    Finished runWithPassword(std::vector<std::string> arguments,
                             const std::string& password) const {
        arguments.insert(arguments.end(), {"--password-stdin", "--root", root});
        return runProcessWithInput(password + "\n", qelosimCommand(std::move(arguments)),
                                   {{"LC_ALL", "C.UTF-8"}});
    }

    void expectDone(const Finished& finished, const std::string& words) const {
        EXPECT_EQ(finished.status, 0) << finished.err;
        EXPECT_EQ(finished.out, words + "\n");
        EXPECT_EQ(finished.err, "");
    }

    std::string entry(const std::string& file, const std::string& name) const {
        std::istringstream lines(contentOf(root + "/etc/" + file));
        for (std::string line; std::getline(lines, line);) {
            if (line.compare(0, name.size() + 1, name + ":") == 0) {
                return line;
            }
        }
        return {};
    }

    std::string field(const std::string& file, const std::string& name, std::size_t index) const {
        std::istringstream fields(entry(file, name));
        std::string value;
        for (std::size_t i = 0; i <= index && std::getline(fields, value, ':'); ++i) {
        }
        return value;
    }

    // Whether a field of any line of a file has this value.
    bool hasField(const std::string& file, std::size_t index, const std::string& value) const {
        std::istringstream lines(contentOf(root + "/etc/" + file));
        for (std::string line; std::getline(lines, line);) {
            if (field(file, line.substr(0, line.find(':')), index) == value) {
                return true;
            }
        }
        return false;
    }

    // The account as the provider serves it now.
    nlohmann::json account(const std::string& name) const {
        const auto found =
            qelosimJson({"gi", "ZANTH_Account.Name=\"" + name + "\"", "--root", root});
        return found.is_array() && !found.empty() ? found[0]["properties"] : nlohmann::json();
    }

    Scratch scratch;
    std::string root;
    std::vector<std::string> machine;
};

TEST_F(UserLife, A_user_is_created_changed_locked_and_deleted) {
    expectDone(runWithPassword({"create-user", "alice", "--full-name", "Alice Example", "--uid",
                                "4711", "--home", "/home/alice", "--shell", "/bin/sh"},
                               "open sesame"),
               "created account alice");
    EXPECT_EQ(field("passwd", "alice", 2), "4711");
    EXPECT_EQ(field("passwd", "alice", 5), "/home/alice");
    const std::string hash = field("shadow", "alice", 1);
    EXPECT_EQ(crypt("open sesame", hash.c_str()), hash);
    auto alice = account("alice");
    EXPECT_EQ(alice["Description"], "Alice Example");
    EXPECT_EQ(alice["UserID"], "4711");
    EXPECT_EQ(alice["EnabledState"], 2);
    EXPECT_EQ(alice["UserPassword"][0], "");

    expectDone(run({"disable-user", "alice"}), "disabled account alice");
    EXPECT_EQ(account("alice")["EnabledState"], 3);
    EXPECT_EQ(account("alice")["AccountDisable"], true);
    expectDone(run({"enable-user", "alice"}), "enabled account alice");
    EXPECT_EQ(field("shadow", "alice", 1), hash);

    expectDone(run({"modify-user", "alice", "--full-name", "Alice B.", "--shell", "/bin/dash",
                    "--min-days", "1", "--max-days", "90", "--warn-days", "8", "--inactive-days",
                    "30", "--expires", "2030-01-02"}),
               "changed account alice");
    alice = account("alice");
    EXPECT_EQ(alice["Description"], "Alice B.");
    EXPECT_EQ(alice["ScriptPath"], "/bin/dash");
    EXPECT_EQ(alice["daysMustKeepPassword"], 1);
    EXPECT_EQ(alice["daysMustChangePasswordAfter"], 90);
    EXPECT_EQ(alice["daysWarnBeforePasswordExpire"], 8);
    EXPECT_EQ(alice["daysExpireAfter"], 30);
    EXPECT_EQ(alice["passwordExpirationDate"], "20300102000000.000000+000");
    EXPECT_EQ(field("shadow", "alice", 1), hash) << "what is not given stays as it is";

    expectDone(runWithPassword({"set-password", "alice"}, "xyzzy plugh"),
               "set the password of account alice");
    const std::string second = field("shadow", "alice", 1);
    EXPECT_EQ(crypt("xyzzy plugh", second.c_str()), second);

    expectDone(run({"delete-user", "alice"}), "deleted account alice");
    EXPECT_EQ(entry("passwd", "alice"), "");
    EXPECT_EQ(entry("shadow", "alice"), "");
    EXPECT_EQ(entry("group", "alice"), "");
    EXPECT_EQ(run({"gi", "ZANTH_Account.Name=\"alice\""}).status, 6);
}

TEST_F(UserLife, A_home_is_made_with_its_account_and_removed_with_it) {
    // An ordinary user can give a directory to nobody but himself.
    const bool superuser = geteuid() == 0;
    const std::string uid = superuser ? "4711" : std::to_string(geteuid());
    const std::string gid = superuser ? "4712" : std::to_string(getegid());
    if (hasField("passwd", 2, uid)) {
        GTEST_SKIP() << "the scratch root has an account of this user's own id " << uid
                     << ", and only the superuser may make homes for others";
    }
    if (!hasField("group", 2, gid)) {
        expectDone(run({"create-group", "crew", "--gid", gid}), "created group crew");
    }
    expectDone(run({"create-user", "alice", "--uid", uid, "--gid", gid, "--home", "/home/alice",
                    "--create-home"}),
               "created account alice");
    struct stat home {};
    ASSERT_EQ(stat((root + "/home/alice").c_str(), &home), 0);
    EXPECT_TRUE(S_ISDIR(home.st_mode));
    EXPECT_EQ(std::to_string(home.st_uid), uid);
    EXPECT_EQ(std::to_string(home.st_gid), gid);
    expectDone(run({"delete-user", "alice", "--remove-home"}), "deleted account alice");
    EXPECT_EQ(entry("passwd", "alice"), "");
    EXPECT_FALSE(std::filesystem::exists(root + "/home/alice"));
}

TEST_F(UserLife, Only_the_superuser_makes_homes_for_others) {
    if (geteuid() == 0) {
        GTEST_SKIP() << "the superuser may make homes for others";
    }
    const std::string other = std::to_string(geteuid() + 1);
    const Finished refused = run({"create-user", "alice", "--uid", other, "--create-home"});
    EXPECT_EQ(refused.status, 1) << refused.out;
    EXPECT_EQ(entry("passwd", "alice"), "");
    EXPECT_FALSE(std::filesystem::exists(root + "/home/alice"));
}

TEST_F(UserLife, Groups_are_created_filled_and_deleted) {
    expectDone(run({"create-user", "bob"}), "created account bob");
    expectDone(run({"create-group", "crew", "--gid", "5000"}), "created group crew");
    expectDone(run({"add-member", "crew", "bob"}), "added member to group crew bob");
    EXPECT_EQ(entry("group", "crew"), "crew:x:5000:bob");
    const Finished groups = run({"groups"});
    EXPECT_NE(groups.out.find("crew"), std::string::npos);
    EXPECT_TRUE(std::regex_search(groups.out, std::regex("crew +5000 +1 +bob\n"))) << groups.out;
    expectDone(run({"remove-member", "crew", "bob"}), "removed member from group crew bob");
    EXPECT_EQ(entry("group", "crew"), "crew:x:5000:");
    expectDone(run({"delete-group", "crew"}), "deleted group crew");
    EXPECT_EQ(entry("group", "crew"), "");
}

TEST_F(UserLife, A_refused_command_fails_in_one_line_and_changes_nothing) {
    const std::string before = contentOf(root + "/etc/passwd") + contentOf(root + "/etc/shadow");
    for (const std::vector<std::string>& arguments :
         std::vector<std::vector<std::string>>{{"create-user", "Alice"},
                                               {"create-user", "--", "-rf"},
                                               {"create-user", "eve:0:0"},
                                               {"create-user", "eve", "--uid", "0"},
                                               {"create-user", "eve", "--uid", "4294967295"},
                                               {"create-user", "eve", "--home", "/home/../etc"},
                                               {"create-user", "eve", "--full-name", "x\ny:0"},
                                               {"delete-user", "root"},
                                               {"disable-user", "root"},
                                               {"modify-user", "root", "--uid", "5"},
                                               {"delete-user", "nobody-here"},
                                               {"create-user", "root"}}) {
        // The options of the root directory stand in front, where "--" does not hide them.
        std::vector<std::string> command = {arguments[0], "--root", root};
        command.insert(command.end(), arguments.begin() + 1, arguments.end());
        const Finished finished = qelosim(command);
        EXPECT_EQ(finished.status, 1) << arguments[1] << finished.out;
        EXPECT_EQ(finished.out, "");
        EXPECT_EQ(std::count(finished.err.begin(), finished.err.end(), '\n'), 1) << finished.err;
        EXPECT_EQ(contentOf(root + "/etc/passwd") + contentOf(root + "/etc/shadow"), before)
            << arguments[1];
    }
}

TEST_F(UserLife, A_refused_command_says_why_wherever_the_log_goes) {
    const std::string config = scratch.write("logging.conf", "log = none\nlog.level = off\n");
    for (const Variables& variables : {Variables{}, Variables{{"QELO_LOG_CONFIG", config}}}) {
        const Finished administered =
            runProcess(qelosimCommand({"delete-user", "root", "--root", root}), variables);
        EXPECT_EQ(administered.err, "qelosim: delete-user: refused or failed, nothing was changed: "
                                    "DeleteUser: the superuser cannot be deleted "
                                    "(CIM_ERR_FAILED, 1)\n");
        const Finished called = runProcess(
            qelosimCommand({"cm", "ZANTH_Account", "DeleteUser", "Name=root", "--root", root}),
            variables);
        EXPECT_EQ(called.err, "qelosim: cm: Execute Method Failed: DeleteUser: the superuser "
                              "cannot be deleted (CIM_ERR_FAILED, 1)\n");
    }
}

TEST_F(UserLife, The_log_of_a_refusal_goes_where_the_user_wants_it) {
    const std::string log = scratch.path("log");
    const std::string config =
        scratch.write("logging.conf", "log = file:" + log + "\nlog.level = 6000\n");
    runProcess(qelosimCommand({"delete-user", "root", "--root", root}),
               {{"QELO_LOG_CONFIG", config}});
    EXPECT_NE(contentOf(log).find("Qelo.AdminCommand"), std::string::npos);
    EXPECT_NE(contentOf(log).find("the superuser cannot be deleted"), std::string::npos);
}

TEST_F(UserLife, No_password_is_told_with_the_reason_of_a_refusal) {
    for (const std::vector<std::string>& arguments :
         std::vector<std::vector<std::string>>{{"set-password", "nobody-here"},
                                               {"create-user", "root"},
                                               {"create-user", "Bad:Name"}}) {
        for (const char* password : {"xyzzy,plugh:CMPI", "xyzzy plugh"}) {
            const Finished finished = runWithPassword(arguments, password);
            EXPECT_EQ(finished.status, 1);
            EXPECT_EQ(finished.err.find("xyzzy"), std::string::npos) << finished.err;
            EXPECT_EQ(finished.err.find("plugh"), std::string::npos) << finished.err;
            EXPECT_EQ(std::count(finished.err.begin(), finished.err.end(), '\n'), 1);
        }
    }
}

TEST_F(UserLife, Methods_can_be_called_under_their_own_names) {
    const Finished created =
        run({"cm", "ZANTH_Account", "CreateUser", "Name=carol", "UserID:uint32=4242"});
    EXPECT_EQ(created.status, 0) << created.err;
    EXPECT_EQ(field("passwd", "carol", 2), "4242");
    EXPECT_EQ(run({"cm", "ZANTH_Account", "CreateUser", "Name=dave", "Surprise=1"}).status, 4);
    EXPECT_EQ(run({"cm", "zanth_account", "createuser", "NAME=erin"}).status, 0);
    EXPECT_NE(entry("passwd", "erin"), "");
    EXPECT_EQ(entry("passwd", "dave"), "");
    EXPECT_EQ(run({"cm", "ZANTH_Group", "CreateGroup", "Name=crew"}).status, 0);
    EXPECT_NE(entry("group", "crew"), "");
}

TEST_F(UserLife, Commands_of_several_processes_all_succeed) {
    constexpr int users = 12;
    std::vector<std::thread> threads;
    std::vector<Finished> results(users);
    for (int i = 0; i < users; ++i) {
        threads.emplace_back([this, i, &results] {
            results[static_cast<std::size_t>(i)] = run({"create-user", "u" + std::to_string(i)});
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    std::vector<std::string> ids;
    for (int i = 0; i < users; ++i) {
        EXPECT_EQ(results[static_cast<std::size_t>(i)].status, 0)
            << results[static_cast<std::size_t>(i)].err;
        ids.push_back(field("passwd", "u" + std::to_string(i), 2));
    }
    std::sort(ids.begin(), ids.end());
    EXPECT_EQ(std::unique(ids.begin(), ids.end()), ids.end());
}

TEST_F(UserLife, A_node_file_takes_no_commands) {
    const std::string file = scratch.write(
        "nodes.json", R"({"nodes":[{"type":17,"path":"/UserAdministration/1","properties":{}}]})");
    const Finished finished = qelosim({"create-user", "eve", "--store", "file:" + file});
    EXPECT_EQ(finished.status, 1);
    EXPECT_EQ(finished.err, "qelosim: create-user: refused or failed, nothing was changed: a node "
                            "file takes no commands (CIM_ERR_FAILED, 1)\n");
}

TEST_F(UserLife, A_scratch_root_is_not_made_over_an_existing_one) {
    const std::string before = contentOf(root + "/etc/passwd");
    const Finished again = qelosim({"init-root", root});
    EXPECT_NE(again.status, 0);
    EXPECT_EQ(contentOf(root + "/etc/passwd"), before);
}

TEST(ThisMachine, Its_accounts_are_not_changed_by_ordinary_users) {
    if (geteuid() == 0) {
        GTEST_SKIP() << "the superuser may change them";
    }
    const Finished finished = qelosim({"create-user", "eve", "--store", "accounts:/"});
    EXPECT_EQ(finished.status, 66);
    EXPECT_NE(finished.err.find("only root"), std::string::npos);
}

} // namespace
} // namespace qelo::endtoend
