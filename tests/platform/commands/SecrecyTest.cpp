// Passwords are nowhere but in the command, and hashes nowhere but in the shadow file.
#include "CommandExecutor.h"
#include "CommandLog.h"
#include "CommandTest.h"
#include "PasswordHash.h"

#include <crypt.h>
#include <set>

namespace qelo::test {

namespace {

using testing::Contains;
using testing::HasSubstr;
using testing::Not;

class Secrecy : public CommandTest {
protected:
    // Runs a command with recorded tools; keeps whatever anybody can see of it.
    void watch(const std::string& method, const std::vector<std::string>& arguments) {
        const auto status =
            store::executeCommand(root(), command(method, arguments), store::systemFiles(), tools_);
        seen_.push_back(status ? *status : status.reason());
        seen_.push_back(run(method, arguments).status);
    }

    std::vector<std::string> seen() {
        std::vector<std::string> all = seen_;
        for (const RecordedCall& call : tools_.calls()) {
            all.push_back(call.program + call.line() + " < " + call.input);
        }
        for (const LogLine& line : takeLogLines()) {
            all.push_back(line.message);
        }
        for (const auto& [path, content] : stateOf(root())) {
            all.push_back(path + content);
        }
        return all;
    }

    RecordingTools tools_;

private:
    std::vector<std::string> seen_;
};

} // namespace

TEST_F(Secrecy, No_password_is_seen_in_arguments_input_logs_status_or_files) {
    const std::vector<std::string> passwords{"Zq9-first", "Zq9:second", "Zq9;third",
                                             "Zq9 $(fourth)", "Zq9\\fifth"};
    watch("CreateUser", {text("Name", "alice"), text("UserPassword", passwords[0])});
    watch("SetPassword", {text("Name", "alice"), text("UserPassword", passwords[1])});
    watch("ModifyUser", {text("Name", "alice"), text("UserPassword", passwords[2])});
    for (const std::string& password : passwords) {
        // Each fails in its own way: no account, no number, cut in two, unknown, ill-typed.
        watch("SetPassword", {text("Name", "none"), text("UserPassword", password)});
        watch("CreateUser", {text("Name", "alice"), text("UserPassword", password)});
        watch("CreateUser",
              {text("Name", "b"), text("UserPassword", password), number("UserID", -1)});
        watch("SetPassword", {text("Name", "alice"), text("UserPassword", "x"), password});
        watch("SetPassword", {text("Name", "alice"), text("Password", password)});
        watch("SetPassword", {text("Name", "alice"), "UserPassword:CMPI_uint32:" + password});
        watch("SetPassword", {text("Name", "alice"), text("UserPassword", password + "\n")});
        watch("SetPassword",
              {text("Name", "alice"), text("UserPassword", password + std::string(1000, 'x'))});
    }
    for (const std::string& text : seen()) {
        EXPECT_THAT(text, Not(HasSubstr("Zq9")));
    }
}

TEST_F(Secrecy, No_hash_is_seen_in_arguments_logs_or_status) {
    watch("CreateUser", {text("Name", "alice"), text("UserPassword", "pw")});
    watch("DisableUser", {text("Name", "alice")});
    watch("SetPassword", {text("Name", "alice"), text("UserPassword", "pw")});
    watch("EnableUser", {text("Name", "alice")});
    watch("DeleteUser", {text("Name", "alice")});
    for (const std::string& text : seen()) {
        EXPECT_THAT(text, Not(HasSubstr("$y$")));
    }
}

TEST_F(Secrecy, Every_hash_has_a_salt_of_its_own_and_the_preferred_method) {
    std::set<std::string> hashes;
    for (int i = 0; i < 5; ++i) {
        const auto hash = store::hashPassword(store::Secret(std::string_view("pw")));
        ASSERT_TRUE(hash);
        hashes.insert(hash->text());
        EXPECT_THAT(hash->text(), testing::StartsWith(::crypt_preferred_method()));
        EXPECT_THAT(hash->text(), Not(HasSubstr(":")));
    }
    EXPECT_EQ(5u, hashes.size());
}

TEST_F(Secrecy, Moving_a_secret_leaves_nothing_behind) {
    store::Secret first(std::string_view("top secret"));
    const char* const bytes = first.text();
    store::Secret second(std::move(first));
    EXPECT_EQ(bytes, second.text());
    EXPECT_TRUE(first.empty()); // NOLINT(bugprone-use-after-move): that is the question
    EXPECT_STREQ("", first.text());
    first = std::move(second);
    EXPECT_EQ("top secret", first.view());
}

TEST_F(Secrecy, Tools_get_the_name_behind_the_end_of_options) {
    watch("CreateUser", {text("Name", "alice"), text("UserPassword", "pw")});
    watch("ModifyUser", {text("Name", "alice"), text("FullName", "-rf")});
    watch("DisableUser", {text("Name", "alice")});
    watch("AddMember", {text("Name", "users"), text("Member", "alice")});
    watch("DeleteUser", {text("Name", "alice")});
    const auto calls = tools_.calls();
    ASSERT_EQ(5u, calls.size());
    for (const RecordedCall& call : calls) {
        EXPECT_EQ("--prefix", call.arguments.at(0));
        EXPECT_EQ(root().native(), call.arguments.at(1));
        EXPECT_EQ("--", call.arguments.at(call.arguments.size() - 2));
        EXPECT_EQ("alice", call.arguments.back());
        EXPECT_THAT(call.arguments, Not(Contains("-r")));
    }
    EXPECT_EQ("--comment=-rf", calls[1].arguments.at(2));
}

} // namespace qelo::test
