#include "MethodWorld.h"

#include "endtoend/Process.h"

#include "ScratchRoot.h"

#include <fcntl.h>
#include <regex>
#include <sys/file.h>
#include <unistd.h>

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

// An ordinary user can only make home directories that are his own.
long ownUser() { return isSuperuser() ? 4000 : static_cast<long>(::getuid()); }
long ownGroup() { return isSuperuser() ? 4000 : static_cast<long>(::getgid()); }

const std::string kAlice = text("Name", "alice");

std::vector<SweptMethod> userMethods() {
    const std::string group =
        command("CreateGroup", {text("Name", "own"), number("GroupId", ownGroup())});
    const std::string user = command("CreateUser", {kAlice, text("UserPassword", "pw")});
    const std::string other = command("CreateUser", {text("Name", "zoe")});
    const std::vector<std::string> withHome = {
        kAlice,
        number("UserID", ownUser()),
        number("GroupId", ownGroup()),
        text("HomeDirectory", "/a/a directory with a name that is long/alice"),
        number("CreateHome", 1),
        text("UserPassword", "a password that is long")};
    const std::string owner =
        command("CreateUser", {withHome.begin(), withHome.begin() + 3}); // without the home
    const std::string member =
        command("AddMember", {text("Name", "users"), text("Member", "alice")});
    return {
        {"CreateUser", "CreateUser", {other}, {kAlice, text("FullName", "Alice with a long name")}},
        {"CreateUserWithHome", "CreateUser", {group, other}, withHome},
        {"ModifyUser",
         "ModifyUser",
         {user, other},
         {kAlice, text("FullName", "Alice with a long name"),
          text("ScriptPath", "/bin/a shell with a name"), text("HomeDirectory", "/c/al"),
          number("daysMustKeepPassword", 1), number("daysMustChangePasswordAfter", 90),
          dateTime("PasswordExpiration", "20300102000000.000000+000")}},
        {"ModifyUserWithHome",
         "ModifyUser",
         {group, owner, other},
         {kAlice, text("HomeDirectory", withHome[3].substr(withHome[3].rfind(':') + 1)),
          number("CreateHome", 1)}},
        {"DeleteUser", "DeleteUser", {user, other, member}, {kAlice}},
        {"DeleteUserWithHome",
         "DeleteUser",
         {group, command("CreateUser", withHome), other, member},
         {kAlice, number("RemoveHome", 1)}},
        {"SetPassword",
         "SetPassword",
         {command("CreateUser", {kAlice}), other},
         {kAlice, text("UserPassword", "new")}},
        {"EnableUser", "EnableUser", {user, command("DisableUser", {kAlice})}, {kAlice}},
        {"DisableUser", "DisableUser", {user}, {kAlice}}};
}

std::vector<SweptMethod> groupMethods() {
    const std::string user = command("CreateUser", {kAlice});
    const std::string group = command("CreateGroup", {text("Name", "own")});
    const std::vector<std::string> membership = {text("Name", "users"), text("Member", "alice")};
    return {{"CreateGroup", "CreateGroup", {group}, {text("Name", "devs")}},
            {"DeleteGroup", "DeleteGroup", {group}, {text("Name", "own")}},
            {"AddMember", "AddMember", {user}, membership},
            {"RemoveMember", "RemoveMember", {user, command("AddMember", membership)}, membership}};
}

// Only the superuser can give files to other accounts.
SweptMethod renumbering() {
    const std::string user =
        command("CreateUser", {kAlice, number("UserID", 4000), number("CreateHome", 1)});
    return {"ModifyUserNumber", "ModifyUser", {user}, {kAlice, number("UserID", 5000)}};
}

// Something to copy and to remove on several levels.
void fillSkeleton(const fs::path& skeleton) {
    const fs::path below = skeleton / "a directory with a long name" / "below it";
    fs::create_directories(below);
    for (const char* name : {"a file with quite a long name", "b", "c"}) {
        write(below / name, "text\n");
        write(skeleton / name, "text\n");
    }
    fs::create_symlink("a file with quite a long name", skeleton / "link");
}

} // namespace

std::vector<SweptMethod> sweptMethods() {
    std::vector<SweptMethod> methods = userMethods();
    if (isSuperuser()) {
        methods.push_back(renumbering());
    }
    const std::vector<SweptMethod> ofGroups = groupMethods();
    methods.insert(methods.end(), ofGroups.begin(), ofGroups.end());
    return methods;
}

MethodWorld::MethodWorld(const SweptMethod& method) {
    EXPECT_TRUE(store::initRoot(root_).accepted);
    fillSkeleton(root_ / "etc/skel");
    for (const std::string& line : method.before) {
        const store::CommandOutcome outcome = store::executeAdminCommand(root_, line);
        EXPECT_TRUE(outcome.accepted) << line << ": " << outcome.status;
    }
    before_ = state();
    fs::create_directory(pristine_);
    EXPECT_EQ(endtoend::runProcess({"cp", "-a", root_, pristine_}).status, 0);
    const store::CommandOutcome good =
        store::executeAdminCommand(root_, command(method.method, method.arguments));
    EXPECT_TRUE(good.accepted) << good.status;
    after_ = state();
    EXPECT_NE(before_, after_);
    renew();
}

void MethodWorld::renew() {
    fs::remove_all(root_);
    EXPECT_EQ(endtoend::runProcess({"cp", "-a", pristine_ / "root", root_}).status, 0);
}

MethodWorld::State MethodWorld::state() const {
    static const std::regex hash("\\$y\\$[^:\n]*");
    State state = stateOf(root_);
    std::string& shadow = state["etc/shadow"];
    shadow = std::regex_replace(shadow, hash, "HASH");
    return state;
}

MethodWorld::State MethodWorld::withoutRests(State state) {
    for (auto entry = state.begin(); entry != state.end();) {
        const bool rest = entry->first.find(".qelosim-old-") != std::string::npos;
        entry = rest ? state.erase(entry) : std::next(entry);
    }
    return state;
}

bool MethodWorld::isUnlocked() const {
    const int file = ::open((root_ / "etc/.qelosim.lock").c_str(), O_RDWR | O_CLOEXEC);
    if (file < 0) {
        return errno == ENOENT;
    }
    const bool free = ::flock(file, LOCK_EX | LOCK_NB) == 0;
    ::close(file);
    return free;
}

} // namespace qelo::test
