// Commands on groups.
#include "CommandTest.h"

namespace qelo::test {

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class GroupCommand : public CommandTest {
protected:
    // An entry that no command could make.
    void addGroupLine(const std::string& name, const std::string& id, const std::string& members) {
        write(etc("group"), contentOf(etc("group")) + name + ":x:" + id + ":" + members + "\n");
        write(etc("gshadow"), contentOf(etc("gshadow")) + name + ":!::" + members + "\n");
    }
};

} // namespace

TEST_F(GroupCommand, A_group_is_created_and_deleted) {
    const auto before = stateOf(root());
    accept("CreateGroup", {text("Name", "devs")});
    accept("CreateGroup", {text("Name", "ops"), number("GroupId", 4000)});
    EXPECT_THAT(group("devs"), ElementsAre("devs", "x", "1000", ""));
    EXPECT_THAT(group("ops"), ElementsAre("ops", "x", "4000", ""));
    accept("DeleteGroup", {text("Name", "devs")});
    accept("DeleteGroup", {text("Name", "ops")});
    EXPECT_EQ(before, stateOf(root()));
}

TEST_F(GroupCommand, Members_come_and_go_in_both_files) {
    accept("CreateUser", {text("Name", "alice")});
    accept("CreateUser", {text("Name", "bob")});
    accept("AddMember", {text("Name", "users"), text("Member", "alice")});
    accept("AddMember", {text("Name", "users"), text("Member", "bob")});
    accept("AddMember", {text("Name", "users"), text("Member", "bob")});
    EXPECT_EQ("alice,bob", group("users").at(3));
    EXPECT_EQ("alice,bob", lineOf(etc("gshadow"), "users").at(3));
    accept("RemoveMember", {text("Name", "users"), text("Member", "alice")});
    EXPECT_EQ("bob", group("users").at(3));
    EXPECT_EQ("bob", lineOf(etc("gshadow"), "users").at(3));
}

TEST_F(GroupCommand, Other_memberships_of_the_member_stay) {
    accept("CreateUser", {text("Name", "alice")});
    for (const char* name : {"one", "two", "three"}) {
        accept("CreateGroup", {text("Name", name)});
        accept("AddMember", {text("Name", name), text("Member", "alice")});
    }
    accept("RemoveMember", {text("Name", "two"), text("Member", "alice")});
    EXPECT_EQ("alice", group("one").at(3));
    EXPECT_EQ("", group("two").at(3));
    EXPECT_EQ("alice", group("three").at(3));
}

TEST_F(GroupCommand, A_group_whose_name_reads_as_a_number_is_not_taken_for_another) {
    accept("CreateUser", {text("Name", "alice")});
    for (const char* name : {"100", " 100", "0"}) {
        addGroupLine(name, std::to_string(500 + std::string(name).size()), "");
        accept("AddMember", {text("Name", name), text("Member", "alice")});
        EXPECT_EQ("alice", group(name).at(3)) << name;
        EXPECT_EQ("", group("users").at(3));
        EXPECT_EQ("", group("root").at(3));
        accept("RemoveMember", {text("Name", name), text("Member", "alice")});
        EXPECT_EQ("", group(name).at(3)) << name;
    }
}

TEST_F(GroupCommand, A_member_without_account_can_be_removed) {
    addGroupLine("old", "500", "gone,nobody,-x");
    accept("RemoveMember", {text("Name", "old"), text("Member", "gone")});
    EXPECT_EQ("nobody,-x", group("old").at(3));
    accept("RemoveMember", {text("Name", "old"), text("Member", "-x")});
    EXPECT_EQ("nobody", group("old").at(3));
    EXPECT_EQ("nobody", lineOf(etc("gshadow"), "old").at(3));
}

TEST_F(GroupCommand, Groups_with_names_that_could_not_be_created_are_served) {
    accept("CreateUser", {text("Name", "alice")});
    for (const char* name : {"Domain Users", "a.b", "g$", "caf\xc3\xa9", "x;y"}) {
        addGroupLine(name, "500", "");
        accept("AddMember", {text("Name", name), text("Member", "alice")});
        EXPECT_EQ("alice", group(name).at(3)) << name;
        accept("RemoveMember", {text("Name", name), text("Member", "alice")});
        accept("DeleteGroup", {text("Name", name)});
        EXPECT_THAT(group(name), IsEmpty());
    }
}

TEST_F(GroupCommand, What_cannot_be_is_refused) {
    accept("CreateUser", {text("Name", "alice")});
    EXPECT_THAT(refuse("CreateGroup", {text("Name", "users")}), HasSubstr("the group exists"));
    EXPECT_THAT(refuse("CreateGroup", {text("Name", "new"), number("GroupId", 100)}),
                HasSubstr("in use"));
    EXPECT_THAT(refuse("CreateGroup", {text("Name", "new"), number("GroupId", 0)}),
                HasSubstr("in use"));
    EXPECT_THAT(refuse("DeleteGroup", {text("Name", "none")}), HasSubstr("no such group"));
    EXPECT_THAT(refuse("DeleteGroup", {text("Name", "root")}), HasSubstr("superuser"));
    EXPECT_THAT(refuse("DeleteGroup", {text("Name", "alice")}), HasSubstr("primary group"));
    EXPECT_THAT(refuse("AddMember", {text("Name", "none"), text("Member", "alice")}),
                HasSubstr("no such group"));
    EXPECT_THAT(refuse("AddMember", {text("Name", "users"), text("Member", "none")}),
                HasSubstr("no such account"));
    EXPECT_THAT(refuse("RemoveMember", {text("Name", "users"), text("Member", "alice")}),
                HasSubstr("no such member"));
    EXPECT_THAT(refuse("RemoveMember", {text("Name", "none"), text("Member", "alice")}),
                HasSubstr("no such group"));
}

TEST_F(GroupCommand, A_group_that_is_there_twice_is_left_alone) {
    addGroupLine("twin", "500", "nobody");
    addGroupLine("twin", "501", "");
    expectFaults();
    EXPECT_THAT(refuse("DeleteGroup", {text("Name", "twin")}), HasSubstr("twice"));
    EXPECT_THAT(refuse("AddMember", {text("Name", "twin"), text("Member", "root")}),
                HasSubstr("twice"));
    EXPECT_THAT(refuse("RemoveMember", {text("Name", "twin"), text("Member", "nobody")}),
                HasSubstr("twice"));
}

TEST_F(GroupCommand, A_root_without_gshadow_is_served) {
    std::filesystem::remove(etc("gshadow"));
    expectFaults();
    accept("CreateUser", {text("Name", "alice")});
    accept("CreateGroup", {text("Name", "devs")});
    accept("AddMember", {text("Name", "devs"), text("Member", "alice")});
    EXPECT_EQ("alice", group("devs").at(3));
    accept("RemoveMember", {text("Name", "devs"), text("Member", "alice")});
    accept("DeleteUser", {text("Name", "alice")});
    accept("DeleteGroup", {text("Name", "devs")});
    EXPECT_FALSE(std::filesystem::exists(etc("gshadow")));
}

} // namespace qelo::test
