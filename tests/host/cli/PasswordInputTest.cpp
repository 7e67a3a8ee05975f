#include "StandardInput.h"

#include <cli/CommandContext.h>
#include <cli/PasswordInput.h>

#include <gtest/gtest.h>

#include <array>
#include <poll.h>
#include <pty.h>
#include <sys/wait.h>

namespace qelo::cli {
namespace {

std::string fromInput(const std::string& text) {
    const StandardInput input(text);
    return passwordFromInput().text();
}

std::string problemWith(const std::string& text) {
    try {
        return "accepted: " + fromInput(text);
    } catch (const UsageError& error) {
        return error.what();
    }
}

TEST(PasswordInput, The_first_line_is_the_password) {
    EXPECT_EQ(fromInput("secret\n"), "secret");
    EXPECT_EQ(fromInput("secret"), "secret");
    EXPECT_EQ(fromInput("secret\nmore\n"), "secret");
}

TEST(PasswordInput, Everything_but_the_line_end_belongs_to_it) {
    EXPECT_EQ(fromInput(" a\tb \r\n"), " a\tb \r");
    EXPECT_EQ(fromInput("pässwörd\xff\n"), "pässwörd\xff");
}

TEST(PasswordInput, What_stands_behind_the_line_is_left_for_others) {
    const StandardInput input("secret\nrest\n");
    EXPECT_EQ(passwordFromInput().text(), "secret");
    EXPECT_EQ(passwordFromInput().text(), "rest");
}

TEST(PasswordInput, No_password_is_a_usage_error) {
    EXPECT_EQ(problemWith(""), "no password was given");
    EXPECT_EQ(problemWith("\nsecret\n"), "no password was given");
}

TEST(PasswordInput, What_no_password_can_be_is_a_usage_error) {
    EXPECT_EQ(problemWith(std::string("a\0b\n", 4)), "what was given cannot be a password");
    EXPECT_EQ(problemWith(std::string(1024, 'x') + "\n"), "what was given cannot be a password");
    EXPECT_EQ(fromInput(std::string(1023, 'x') + "\n"), std::string(1023, 'x'));
}

TEST(PasswordInput, A_password_that_was_moved_away_is_still_there_once) {
    Password first(std::string("a long enough secret not to be stored inside"));
    const Password second = std::move(first);
    EXPECT_EQ(second.text(), "a long enough secret not to be stored inside");
}

// What a child with a terminal of its own says there, while each text is typed when the next
// prompt has come; its exit status tells how it ended.
struct Dialogue {
    std::string seen;
    int status = -1;
};

enum ChildStatus { Accepted = 0, Refused = 1, OtherPassword = 2 };

[[noreturn]] void askInChild(const std::string& expected) {
    try {
        _exit(passwordFromTerminal("al").text() == expected ? Accepted : OtherPassword);
    } catch (const UsageError& error) {
        [[maybe_unused]] const ssize_t told =
            write(STDOUT_FILENO, error.what(), std::string(error.what()).size());
        _exit(Refused);
    }
}

// Reads until the text has a prompt more, or the end.
bool readUntilPrompt(int terminal, std::string& seen) {
    const std::size_t before = seen.size();
    std::array<char, 256> buffer{};
    while (seen.find(": ", before) == std::string::npos) {
        pollfd entry{terminal, POLLIN, 0};
        if (poll(&entry, 1, 30000) <= 0) {
            return false;
        }
        const ssize_t got = read(terminal, buffer.data(), buffer.size());
        if (got <= 0) {
            return false;
        }
        seen.append(buffer.data(), static_cast<std::size_t>(got));
    }
    return true;
}

Dialogue converse(const std::vector<std::string>& typed, const std::string& expected) {
    int terminal = -1;
    const pid_t child = forkpty(&terminal, nullptr, nullptr, nullptr);
    if (child == 0) {
        askInChild(expected);
    }
    Dialogue dialogue;
    for (const std::string& text : typed) {
        if (!readUntilPrompt(terminal, dialogue.seen) ||
            write(terminal, text.data(), text.size()) != static_cast<ssize_t>(text.size())) {
            break;
        }
    }
    readUntilPrompt(terminal, dialogue.seen);
    int status = 0;
    waitpid(child, &status, 0);
    close(terminal);
    dialogue.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return dialogue;
}

TEST(PasswordInput, The_terminal_is_asked_twice_and_shows_nothing) {
    const Dialogue dialogue = converse({"open sesame\n", "open sesame\n"}, "open sesame");
    EXPECT_EQ(dialogue.status, Accepted) << dialogue.seen;
    EXPECT_EQ(dialogue.seen, "New password for al: \r\nOnce more: \r\n");
}

TEST(PasswordInput, Two_different_passwords_are_refused) {
    const Dialogue dialogue = converse({"one\n", "another\n"}, "one");
    EXPECT_EQ(dialogue.status, Refused);
    EXPECT_NE(dialogue.seen.find("the two passwords differ"), std::string::npos);
    EXPECT_EQ(dialogue.seen.find("another"), std::string::npos) << dialogue.seen;
}

TEST(PasswordInput, An_empty_line_on_the_terminal_is_no_password) {
    const Dialogue dialogue = converse({"\n"}, "");
    EXPECT_EQ(dialogue.status, Refused);
    EXPECT_NE(dialogue.seen.find("no password was given"), std::string::npos);
}

TEST(PasswordInput, Without_a_terminal_there_is_nobody_to_ask) {
    const pid_t child = fork();
    if (child == 0) {
        // A session of its own has no terminal.
        _exit(setsid() < 0 ? 99 : [] {
            try {
                passwordFromTerminal("al");
                return 98;
            } catch (const UsageError& error) {
                return std::string(error.what()).find("--password-stdin") != std::string::npos ? 0
                                                                                               : 97;
            }
        }());
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    EXPECT_EQ(status, 0);
}

} // namespace
} // namespace qelo::cli
