// What tools have left behind is gone after the next command, and what is in use is not.
#include "CommandTest.h"

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

// No process has this number: it is beyond the greatest one.
const std::string kNobody = "999999999";

class ToolRests : public CommandTest {
protected:
    void leave(const std::string& name, const std::string& content) { write(etc(name), content); }
    bool isThere(const std::string& name) const { return fs::exists(etc(name)); }
};

} // namespace

TEST_F(ToolRests, Of_processes_that_are_gone_are_removed) {
    const std::vector<std::string> rests{"passwd.lock", "shadow." + kNobody, "group.lock"};
    for (const std::string& name : rests) {
        leave(name, kNobody + '\0');
    }
    leave("gshadow+", "half of a");
    accept("CreateGroup", {text("Name", "devs")});
    for (const std::string& name : rests) {
        EXPECT_FALSE(isThere(name)) << name;
    }
    EXPECT_FALSE(isThere("gshadow+"));
}

TEST_F(ToolRests, Of_processes_that_were_killed_while_writing_are_removed) {
    const std::vector<std::string> rests{"group." + kNobody, ".shadow.qelosim"};
    for (const std::string& name : rests) {
        leave(name, "");
    }
    accept("CreateGroup", {text("Name", "devs")});
    for (const std::string& name : rests) {
        EXPECT_FALSE(isThere(name)) << name;
    }
}

TEST_F(ToolRests, Are_removed_after_a_refused_command_too) {
    leave("shadow+", "half of a");
    EXPECT_FALSE(run("CreateGroup", {text("Name", "root")}).accepted);
    EXPECT_FALSE(isThere("shadow+"));
}

TEST_F(ToolRests, That_may_still_be_in_use_stay) {
    expectFaults();
    leave("subuid.lock", std::string("1") + '\0');
    leave("subuid+", "in the making");
    leave("subgid.1", "what is this");
    leave("passwd.txt", "notes");
    accept("CreateGroup", {text("Name", "devs")});
    for (const char* name : {"subuid.lock", "subuid+", "subgid.1", "passwd.txt"}) {
        EXPECT_TRUE(isThere(name)) << name;
    }
}

} // namespace qelo::test
