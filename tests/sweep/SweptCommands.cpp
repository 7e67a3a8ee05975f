#include "SweptCommands.h"

#include "platform/commands/CommandTest.h"

#include <unistd.h>

namespace qelo::test {

namespace {

// An ordinary user can only make home directories that are his own.
long ownUser() { return isSuperuser() ? 4000 : static_cast<long>(::getuid()); }
long ownGroup() { return isSuperuser() ? 4000 : static_cast<long>(::getgid()); }

} // namespace

std::vector<WatchedCommand> sweptCommands() {
    const std::string uid = std::to_string(ownUser());
    const std::string gid = std::to_string(ownGroup());
    const std::string group =
        command("CreateGroup", {text("Name", "own"), number("GroupId", ownGroup())});
    const std::string user =
        command("CreateUser", {text("Name", "alice"), text("UserPassword", "pw")});
    const std::string other = command("CreateUser", {text("Name", "zoe")});
    const std::string withHome =
        command("CreateUser", {text("Name", "alice"), number("UserID", ownUser()),
                               number("GroupId", ownGroup()), text("HomeDirectory", "/a/b/alice"),
                               number("CreateHome", 1), text("UserPassword", "pw")});
    const std::string member =
        command("AddMember", {text("Name", "users"), text("Member", "alice")});
    return {{"CreateUser", {other}, {"create-user", "alice", "--full-name", "Alice"}, ""},
            {"CreateUserWithHome",
             {group, other},
             {"create-user", "alice", "--uid", uid, "--gid", gid, "--home", "/a/b/alice",
              "--create-home", "--password-stdin"},
             "secret\n"},
            {"ModifyUser",
             {user, other},
             {"modify-user", "alice", "--full-name", "Al", "--shell", "/bin/ksh", "--home", "/c/al",
              "--min-days", "1", "--expires", "2030-01-02"},
             ""},
            {"ModifyUserNumbers",
             {group, isSuperuser() ? withHome : user, other},
             {"modify-user", "alice", "--uid", "5001", "--gid", "100", "--password-stdin"},
             "new\n"},
            {"ModifyUserNewHome",
             {group, user, other},
             {"modify-user", "alice", "--uid", uid, "--gid", gid, "--home", "/a/b/alice",
              "--create-home"},
             ""},
            {"DeleteUser", {user, other, member}, {"delete-user", "alice"}, ""},
            {"DeleteUserWithHome",
             {group, withHome, other, member},
             {"delete-user", "alice", "--remove-home"},
             ""},
            {"SetPassword",
             {command("CreateUser", {text("Name", "alice")}), other},
             {"set-password", "alice", "--password-stdin"},
             "new\n"},
            {"EnableUser",
             {user, command("DisableUser", {text("Name", "alice")})},
             {"enable-user", "alice"},
             ""},
            {"DisableUser", {user}, {"disable-user", "alice"}, ""},
            {"CreateGroup", {group}, {"create-group", "devs"}, ""},
            {"DeleteGroup", {group}, {"delete-group", "own"}, ""},
            {"AddMember", {user, other}, {"add-member", "users", "alice"}, ""},
            {"RemoveMember", {user, other, member}, {"remove-member", "users", "alice"}, ""},
            {"InitRoot", {}, {"init-root"}, "", true}};
}

} // namespace qelo::test
