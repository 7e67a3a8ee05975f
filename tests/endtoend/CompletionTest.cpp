// The completion of command lines, run by bash itself.
#include "HelpText.h"

#include <set>
#include <sstream>

namespace qelo::endtoend {
namespace {

using Words = std::set<std::string>;

Words linesOf(const std::string& text) {
    Words words;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);) {
        words.insert(line);
    }
    return words;
}

bool has(const Words& words, const std::string& word) { return words.count(word) > 0; }

class Completion : public ::testing::Test {
protected:
    void SetUp() override {
        if (runProcess({"bash", "-c", "((BASH_VERSINFO[0] >= 4))"}).status != 0) {
            GTEST_SKIP() << "there is no bash 4 here to complete anything";
        }
    }

    // What is offered for the last of these words, as bash splits them.
    Words offered(std::vector<std::string> words, const Variables& more = {}) const {
        // NOLINTBEGIN(bugprone-suspicious-missing-comma): the program is one argument
        words.insert(words.begin(),
                     {"bash", "--norc", "--noprofile", "-c",
                      "set -u; source \"$1\"; shift; COMP_WORDS=(\"$@\"); COMP_CWORD=$(($# - 1)); "
                      "COMP_WORDBREAKS=$' \\t\\n\"\\'><=;|&(:'; _qelosim; "
                      "[[ ${#COMPREPLY[@]} == 0 ]] || printf '%s\\n' \"${COMPREPLY[@]}\"",
                      "bash", QELOSIM_COMPLETION, "qelosim"});
        // NOLINTEND(bugprone-suspicious-missing-comma)
        Variables variables = {{"QELO_NODE_STORE", ""}};
        variables.insert(variables.end(), more.begin(), more.end());
        const Finished finished = runProcess(words, variables);
        EXPECT_EQ(finished.err, "");
        return linesOf(finished.out);
    }

    // A getent that knows these accounts and groups; the variables that make it the first.
    Variables withNames(const std::string& passwd, const std::string& group) const {
        scratch.write("passwd", passwd);
        scratch.write("group", group);
        const std::string program =
            scratch.write("bin/getent", "#!/bin/sh\nexec cat \"${0%/bin/getent}/$1\"\n");
        std::filesystem::permissions(program, std::filesystem::perms::owner_all);
        return {{"PATH", scratch.path("bin") + ":" + std::getenv("PATH")}};
    }

    Scratch scratch;
};

TEST_F(Completion, Every_command_of_the_help_is_offered) {
    const Words commands = offered({""});
    const auto listed = commandsOfHelp();
    EXPECT_GT(listed.size(), 20U);
    for (const std::string& command : listed) {
        EXPECT_TRUE(has(commands, command)) << command;
    }
}

TEST_F(Completion, Every_option_of_the_help_of_every_command_is_offered) {
    std::size_t options = 0;
    for (const std::string& command : commandsOfHelp()) {
        const Words words = offered({command, "-"});
        for (const std::string& option : optionsOfHelp(command)) {
            EXPECT_TRUE(has(words, option)) << command << " " << option;
            ++options;
        }
    }
    EXPECT_GT(options, 100U);
    EXPECT_TRUE(has(offered({"--"}), "--version"));
}

TEST_F(Completion, The_beginning_of_a_word_narrows_what_is_offered) {
    EXPECT_EQ(offered({"cre"}), (Words{"create-group", "create-user"}));
    EXPECT_EQ(offered({"nosuch"}), Words());
    EXPECT_EQ(offered({"--json", "tr"}), Words{"tree"});
    EXPECT_EQ(offered({"--format", "json", "tr"}), Words{"tree"});
}

TEST_F(Completion, Options_are_followed_by_their_values) {
    EXPECT_EQ(offered({"--format", ""}), (Words{"json", "mof", "text"}));
    EXPECT_EQ(offered({"ei", "--format", "j"}), Words{"json"});
    EXPECT_EQ(offered({"ei", "--format", "=", "j"}), Words{"json"});
    EXPECT_EQ(offered({"ain", "-ac", ""}),
              (Words{"ZANTH_AccountHostedService", "ZANTH_SimElementCapabilities"}));
    EXPECT_EQ(offered({"--store", ""}), (Words{"accounts:", "file:"}));
    EXPECT_EQ(offered({"create-user", "--uid", ""}), Words());
}

TEST_F(Completion, Classes_and_methods_are_offered_where_they_belong) {
    EXPECT_EQ(offered({"ei", "ZANTH_G"}), Words{"ZANTH_Group"});
    EXPECT_EQ(offered({"gi", "-p", "Name", "ZANTH_G"}), Words{"ZANTH_Group"});
    EXPECT_EQ(offered({"cm", "ZANTH_Group", ""}),
              (Words{"AddMember", "CreateGroup", "DeleteGroup", "RemoveMember"}));
    EXPECT_EQ(offered({"cm", "ZANTH_Account", "Cr"}), Words{"CreateUser"});
    EXPECT_EQ(offered({"ei", "ZANTH_Group", ""}), Words());
    EXPECT_EQ(offered({"accounts", ""}), Words());
}

TEST_F(Completion, Files_and_directories_are_offered_where_they_are_expected) {
    const std::string file = scratch.write("a file.json", "{}");
    const std::string directory = scratch.path("a dir");
    std::filesystem::create_directory(directory);
    const std::string start = scratch.path("a");
    for (const char* option : {"--root", "--provider-dir", "--schema-dir"}) {
        EXPECT_EQ(offered({"ei", option, start}), Words{directory}) << option;
    }
    EXPECT_EQ(offered({"init-root", start}), Words{directory});
    EXPECT_EQ(offered({"--ca-cert", start}), (Words{directory, file}));
    EXPECT_EQ(offered({"--store", "file", ":", start}), (Words{directory, file}));
    EXPECT_EQ(offered({"--store", "=", "accounts", ":", start}), Words{directory});
}

TEST_F(Completion, Names_of_accounts_and_groups_are_those_of_this_machine) {
    const Variables names = withNames("root:x:0:\nrose:x:1:\n", "crew:x:1:\nrot:x:2:\n");
    for (const char* command :
         {"modify-user", "delete-user", "set-password", "enable-user", "disable-user"}) {
        EXPECT_EQ(offered({command, "ro"}, names), (Words{"root", "rose"})) << command;
    }
    for (const char* command : {"delete-group", "add-member", "remove-member"}) {
        EXPECT_EQ(offered({command, "--json", ""}, names), (Words{"crew", "rot"})) << command;
    }
    EXPECT_EQ(offered({"add-member", "crew", "ro"}, names), (Words{"root", "rose"}));
    EXPECT_EQ(offered({"create-user", "ro"}, names), Words());
}

TEST_F(Completion, No_names_are_offered_for_another_place) {
    Variables names = withNames("root:x:0:\n", "crew:x:1:\n");
    EXPECT_EQ(offered({"delete-user", "--root", "/x", "ro"}, names), Words());
    EXPECT_EQ(offered({"--store", "file", ":", "/x", "delete-user", "ro"}, names), Words());
    EXPECT_EQ(offered({"delete-user", "--url", "=", "http", "://", "h", "ro"}, names), Words());
    names.emplace_back("QELO_NODE_STORE", "file:/x");
    EXPECT_EQ(offered({"delete-user", "ro"}, names), Words());
}

TEST_F(Completion, A_name_is_never_carried_out) {
    const std::string trap = scratch.path("trap");
    const Variables names = withNames("$(touch${IFS}" + trap + "):x:0:\n`touch " + trap +
                                          "`:x:1:\n$PATH:x:2:\n--root:x:3:\nok-1.x:x:4:\n",
                                      "");
    EXPECT_EQ(offered({"delete-user", ""}, names), Words{"ok-1.x"});
    EXPECT_FALSE(std::filesystem::exists(trap));
}

} // namespace
} // namespace qelo::endtoend
