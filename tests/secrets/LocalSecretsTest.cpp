// Passwords that enter through the command line of qelosim itself.
#include "SecretsFixture.h"

#include <gmock/gmock.h>

namespace qelo::secrets {
namespace {

using testing::HasSubstr;

class LocalSecrets : public Secrets {
protected:
    const std::vector<Password> both_ = {Password::plain(), Password::awkward()};
    void expectNoneSeen() {
        for (const Password& password : both_) {
            expectUnseen(password);
        }
    }
};

TEST_F(LocalSecrets, A_password_from_standard_input_is_nowhere_but_in_its_hash) {
    int number = 0;
    for (const Password& password : both_) {
        const std::string name = "user" + std::to_string(number++);
        const std::string line = password.text() + "\n";
        EXPECT_EQ(runWithInput(line, {"create-user", name, "--password-stdin"}).status, 0);
        expectPasswordOf(name, password);
        EXPECT_EQ(runWithInput(line, {"set-password", "alice", "--password-stdin"}).status, 0);
        EXPECT_EQ(runWithInput(line, {"modify-user", name, "--password-stdin"}).status, 0);
        expectPasswordOf("alice", password);
        EXPECT_EQ(run({"gi", "ZANTH_Account.Name=\"alice\"", "--json"}).status, 0);
    }
    EXPECT_THAT(logged(), HasSubstr("SetPassword"));
    EXPECT_THAT(starts(), HasSubstr("starts /usr/sbin/"));
    expectNoneSeen();
}

TEST_F(LocalSecrets, A_password_from_the_terminal_is_nowhere_but_in_its_hash) {
    for (const Password& password : both_) {
        const auto finished = runOnTerminal({password.text(), password.text()},
                                            {"set-password", "alice", "--root", root()});
        EXPECT_EQ(finished.status, 0) << finished.out;
        expectPasswordOf("alice", password);
    }
    const auto finished = runOnTerminal({both_[0].text(), both_[1].text()},
                                        {"set-password", "alice", "--root", root()});
    EXPECT_NE(finished.status, 0);
    EXPECT_THAT(finished.out, HasSubstr("differ"));
    expectNoneSeen();
}

TEST_F(LocalSecrets, A_password_among_the_arguments_of_a_method_goes_no_further) {
    for (const Password& password : both_) {
        EXPECT_EQ(run({"cm", "ZANTH_Account", "SetPassword", "Name=alice",
                       "UserPassword=" + password.text()})
                      .status,
                  0);
        expectPasswordOf("alice", password);
        run({"cm", "ZANTH_Account", "CreateUser", "Name=bob",
             "UserPassword:string=" + password.text()});
    }
    expectNoneSeen();
}

TEST_F(LocalSecrets, A_wrong_command_line_does_not_repeat_its_password) {
    for (const Password& password : both_) {
        const std::string& text = password.text();
        for (const std::vector<std::string>& arguments : std::vector<std::vector<std::string>>{
                 {"set-password", "alice", text},
                 {"create-user", "bob", text},
                 {"create-user", "bob", "--password-stdin=" + text},
                 {"create-user", "bob", "--password-stdin", text},
                 {"create-user", "bob", "--password", text},
                 {"create-user", "bob", "--password=" + text},
                 {"cm", "ZANTH_Account", "SetPassword", "Name=alice", "UserPassword=" + text,
                  "userpassword=" + text},
                 {"cm", "ZANTH_Account", "SetPassword", "Name=alice",
                  "UserPassword:uint32=" + text},
                 {"cm", "ZANTH_Account", "SetPassword", "Name=alice",
                  "UserPassword:nothing=" + text},
                 {"cm", "ZANTH_Account", "SetPassword", "Name=alice", "User-Password=" + text},
                 {"cm", "ZANTH_Account", "SetPassword", "Name=alice", text},
                 {"cm", "ZANTH_Account", "SetPassword", "Name=alice", "NewPassword=" + text},
                 {"set-password", "alice", "--url", "http://root:" + text + "@localhost/x"},
                 {"set-password", "alice", "--url", "ftp://root:" + text + "@localhost"},
                 {"set-password", "alice", "--url", "http//root:" + text + "@localhost"},
             }) {
            const auto finished = run(arguments);
            EXPECT_NE(finished.status, 0) << arguments[0] << " " << arguments[1];
            EXPECT_EQ(password.formsIn(finished.out + finished.err), "")
                << finished.out << finished.err;
        }
    }
    expectNoneSeen();
}

TEST_F(LocalSecrets, A_password_that_is_refused_is_nowhere) {
    for (const Password& password : both_) {
        const std::string& text = password.text();
        for (const std::string& line :
             {text + "," + text, text + "\t" + text, text + std::string(300, 'x'),
              text + std::string(2000, 'x'), text + "\xff", "," + text}) {
            EXPECT_NE(
                runWithInput(line + "\n", {"set-password", "alice", "--password-stdin"}).status, 0)
                << line.size();
        }
        for (const char* name : {"nobody-here", "Bad:Name", "root,UserPassword"}) {
            EXPECT_NE(runWithInput(text + "\n", {"set-password", name, "--password-stdin"}).status,
                      0);
        }
    }
    EXPECT_THAT(logged(), HasSubstr("Command not carried out"));
    expectNoneSeen();
}

TEST_F(LocalSecrets, A_password_that_cannot_be_stored_is_nowhere) {
    const std::string nodes = scratch.write(
        "nodes.json", R"({"nodes":[{"type":17,"path":"/UserAdministration/1","properties":{}}]})");
    std::filesystem::remove(root() + "/etc/shadow");
    std::filesystem::create_directory(root() + "/etc/shadow");
    for (const Password& password : both_) {
        const std::string line = password.text() + "\n";
        EXPECT_NE(runWithInput(line, {"set-password", "alice", "--password-stdin"}).status, 0);
        EXPECT_NE(runWithInput(line, {"create-user", "bob", "--password-stdin"}).status, 0);
        const auto finished = endtoend::runProcessWithInput(
            line, endtoend::qelosimCommand(
                      {"create-user", "bob", "--password-stdin", "--store", "file:" + nodes}));
        EXPECT_NE(finished.status, 0);
        keep(finished.out + finished.err);
    }
    expectNoneSeen();
}

} // namespace
} // namespace qelo::secrets
