// Input that means harm: refused with every file as it was, or stored exactly as given.
#include "CommandTest.h"

#include <crypt.h>

namespace qelo::test {

namespace {

// Texts that have broken other programs.
std::vector<std::string> hostileTexts() {
    return {"",
            " ",
            "-rf",
            "--root",
            "--root=/",
            "--prefix=/",
            "-R/",
            "--",
            "-",
            "+",
            "+@netgroup",
            "#",
            "*",
            "!",
            ".",
            "..",
            "../../etc/passwd",
            "/..",
            "/../../etc",
            "/etc/../etc/shadow",
            "/home/./x",
            "//",
            "/",
            "~root",
            "$(touch /tmp/qelo-pwned)",
            "`touch /tmp/qelo-pwned`",
            "; touch /tmp/qelo-pwned",
            "| sh",
            "&& reboot",
            "> /etc/passwd",
            "$HOME",
            "${IFS}",
            "'",
            "\"",
            "\\",
            "a\\",
            "%s%s%s%n",
            "x:0:0::/:/bin/sh",
            "eve:x:0:0::/:/bin/sh",
            ":",
            "::",
            "a,b",
            ",",
            ",UserID:CMPI_uint32:0",
            "a\nroot2::0:0::/:/bin/sh",
            "a\r",
            "a\tb",
            "a\x1b[2J",
            "\x7f",
            "\x01",
            std::string("a\0b", 3),
            std::string("\0", 1),
            "\xff\xfe",
            "\xc0\xaf",
            "\xc3\x28",
            "\xed\xa0\x80",
            ("\xc2\x9b"
             "31m"),
            "caf\xc3\xa9",
            ("\xe2\x80\xae"
             "drow"),
            "root",
            "ROOT",
            "root ",
            "0",
            "00",
            "-1",
            "4294967296",
            "&",
            std::string(31, 'a'),
            std::string(32, 'a'),
            std::string(33, 'a'),
            std::string(255, 'a'),
            std::string(256, 'a'),
            std::string(900, 'a'),
            std::string(1023, 'a'),
            std::string(1024, 'a'),
            std::string(std::size_t{1} << 20u, 'a')};
}

bool opens(const std::string& hash, const std::string& password) {
    crypt_data data{};
    const char* result = ::crypt_r(password.c_str(), hash.c_str(), &data);
    return result != nullptr && hash == result;
}

// How often each of the two happened, so that a test sees that it tested something.
struct Tally {
    int accepted = 0;
    int refused = 0;
};

class HostileInput : public CommandTest {
protected:
    HostileInput() { accept("CreateUser", {text("Name", "alice")}); }

    void TearDown() override {
        EXPECT_FALSE(std::filesystem::exists("/tmp/qelo-pwned"));
        CommandTest::TearDown();
    }

    // Runs one command; true when it was accepted. A refusal has changed nothing.
    bool attempt(const std::string& method, const std::vector<std::string>& arguments) {
        const auto before = stateOf(root());
        const store::CommandOutcome outcome = run(method, arguments);
        EXPECT_FALSE(outcome.status.empty());
        EXPECT_EQ(std::string::npos, outcome.status.find_first_of("\n\r\t\x1b"));
        ++(outcome.accepted ? tally_.accepted : tally_.refused);
        if (!outcome.accepted) {
            EXPECT_EQ(before, stateOf(root())) << shown(method, arguments);
        }
        EXPECT_THAT(findFaults(root()), testing::IsEmpty()) << shown(method, arguments);
        return outcome.accepted;
    }

    // The number of the superuser's accounts must stay 1 whatever is stored.
    void expectOneSuperuser() const {
        const std::string content = contentOf(etc("passwd"));
        std::size_t count = 0;
        for (std::size_t at = content.find(":0:0:"); at != std::string::npos;
             at = content.find(":0:0:", at + 1)) {
            ++count;
        }
        EXPECT_EQ(1u, count);
    }

    static std::string shown(const std::string& method, const std::vector<std::string>& arguments) {
        return command(method, arguments).substr(0, 200);
    }

    Tally tally_;
};

} // namespace

TEST_F(HostileInput, As_the_name_of_a_new_account) {
    for (const std::string& hostile : hostileTexts()) {
        if (attempt("CreateUser", {text("Name", hostile)})) {
            EXPECT_EQ(hostile, passwd(hostile).at(0));
            EXPECT_EQ(hostile, shadow(hostile).at(0));
            accept("DeleteUser", {text("Name", hostile)});
        }
    }
    expectOneSuperuser();
    EXPECT_EQ(1, tally_.accepted);
    EXPECT_GT(tally_.refused, 70);
}

TEST_F(HostileInput, As_the_name_of_an_existing_account) {
    for (const std::string& hostile : hostileTexts()) {
        if (hostile != "root") {
            EXPECT_FALSE(attempt("DeleteUser", {text("Name", hostile), number("RemoveHome", 1)}));
            EXPECT_FALSE(attempt("DisableUser", {text("Name", hostile)}));
            EXPECT_FALSE(attempt("ModifyUser", {text("Name", hostile), text("FullName", "x")}));
        }
    }
    EXPECT_GT(tally_.refused, 200);
}

TEST_F(HostileInput, As_a_full_name) {
    for (const std::string& hostile : hostileTexts()) {
        if (attempt("ModifyUser", {text("Name", "alice"), text("FullName", hostile)})) {
            EXPECT_EQ(hostile, passwd("alice").at(4));
        }
        if (attempt("CreateUser", {text("Name", "bob"), text("FullName", hostile)})) {
            EXPECT_EQ(hostile, passwd("bob").at(4));
            accept("DeleteUser", {text("Name", "bob")});
        }
    }
    expectOneSuperuser();
    EXPECT_GT(tally_.accepted, 50);
    EXPECT_GT(tally_.refused, 30);
}

TEST_F(HostileInput, As_a_home_directory) {
    for (const std::string& hostile : hostileTexts()) {
        for (const std::string& path : {hostile, "/home/" + hostile}) {
            if (attempt("ModifyUser", {text("Name", "alice"), text("HomeDirectory", path)})) {
                EXPECT_EQ(path, passwd("alice").at(5));
            }
        }
    }
    expectOneSuperuser();
    EXPECT_GT(tally_.accepted, 25);
    EXPECT_GT(tally_.refused, 70);
}

TEST_F(HostileInput, As_a_shell) {
    for (const std::string& hostile : hostileTexts()) {
        for (const std::string& path : {hostile, "/bin/" + hostile}) {
            if (attempt("ModifyUser", {text("Name", "alice"), text("ScriptPath", path)})) {
                EXPECT_EQ(path, passwd("alice").at(6));
            }
        }
    }
    expectOneSuperuser();
    EXPECT_GT(tally_.accepted, 25);
}

TEST_F(HostileInput, As_a_password) {
    for (const std::string& hostile : hostileTexts()) {
        if (attempt("SetPassword", {text("Name", "alice"), text("UserPassword", hostile)})) {
            EXPECT_TRUE(opens(shadow("alice").at(1), hostile));
        }
    }
    expectOneSuperuser();
    EXPECT_GT(tally_.accepted, 40);
    EXPECT_GT(tally_.refused, 15);
}

TEST_F(HostileInput, As_the_name_of_a_group_or_a_member) {
    for (const std::string& hostile : hostileTexts()) {
        if (attempt("CreateGroup", {text("Name", hostile)})) {
            EXPECT_EQ(hostile, group(hostile).at(0));
            accept("DeleteGroup", {text("Name", hostile)});
        }
        if (hostile != "root") {
            EXPECT_FALSE(attempt("DeleteGroup", {text("Name", hostile)}));
            EXPECT_FALSE(attempt("AddMember", {text("Name", "users"), text("Member", hostile)}));
            EXPECT_FALSE(attempt("AddMember", {text("Name", hostile), text("Member", "alice")}));
            EXPECT_FALSE(attempt("RemoveMember", {text("Name", "users"), text("Member", hostile)}));
        }
    }
    EXPECT_EQ(1, tally_.accepted);
    EXPECT_GT(tally_.refused, 300);
}

TEST_F(HostileInput, As_a_number_or_a_date) {
    for (const std::string& hostile : hostileTexts()) {
        for (const char* name : {"UserID", "GroupId", "CreateHome", "daysExpireAfter"}) {
            const bool harmless =
                hostile == "0" && std::string(name) != "UserID" && std::string(name) != "GroupId";
            EXPECT_EQ(harmless || (hostile == "0" && std::string(name) == "GroupId"),
                      attempt("ModifyUser", {text("Name", "alice"),
                                             std::string(name) + ":CMPI_uint32:" + hostile}))
                << name << hostile.substr(0, 40);
        }
        EXPECT_FALSE(attempt("ModifyUser",
                             {text("Name", "alice"), dateTime("PasswordExpiration", hostile)}));
    }
    EXPECT_NE("0", passwd("alice").at(2));
}

TEST_F(HostileInput, As_the_whole_command_or_a_part_of_its_form) {
    for (const std::string& hostile : hostileTexts()) {
        EXPECT_FALSE(attempt(hostile, {}));
        EXPECT_FALSE(attempt("DeleteUser", {hostile}));
        EXPECT_FALSE(attempt("DeleteUser", {hostile + ":CMPI_string:alice"}));
        EXPECT_FALSE(attempt("DeleteUser", {"Name:" + hostile + ":alice"}));
        EXPECT_FALSE(attempt("DeleteUser", {text("Name", "alice"), hostile}));
    }
    EXPECT_GT(tally_.refused, 350);
}

TEST_F(HostileInput, Cannot_smuggle_a_second_argument_through_a_value) {
    // What a gate in front should refuse is an argument of its own here, and given twice.
    EXPECT_FALSE(attempt("CreateUser", {text("Name", "bob"), text("FullName", "x,Name:CMPI_string:"
                                                                              "eve")}));
    EXPECT_TRUE(passwd("eve").empty());
}

} // namespace qelo::test
