// Commands on the machine's own root: of a machine that consists of a scratch directory. The
// test changes its root directory, in a process and name spaces of its own, so that nothing
// outside the scratch directory can be reached.
#include "AccountFileLock.h"
#include "CommandExecutor.h"
#include "CommandTest.h"
#include "ScratchRoot.h"

#include <crypt.h>
#include <csignal>
#include <fcntl.h>
#include <functional>
#include <iostream>
#include <memory>
#include <sched.h>
#include <shadow.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace qelo::test {

namespace {

namespace fs = std::filesystem;

using testing::ElementsAre;
using testing::IsEmpty;

constexpr int kCannotEnter = 77;

bool writeText(const char* path, const std::string& text) {
    const int file = ::open(path, O_WRONLY | O_CLOEXEC);
    const bool written =
        file >= 0 && ::write(file, text.data(), text.size()) == static_cast<ssize_t>(text.size());
    ::close(file);
    return written;
}

// Name spaces in which this process is the superuser, whoever started it.
bool enterNameSpaces() {
    const std::string user = std::to_string(::geteuid());
    const std::string group = std::to_string(::getegid());
    if (isSuperuser()) {
        return ::unshare(CLONE_NEWNS) == 0;
    }
    return ::unshare(CLONE_NEWUSER | CLONE_NEWNS) == 0 &&
           writeText("/proc/self/setgroups", "deny") &&
           writeText("/proc/self/uid_map", "0 " + user + " 1") &&
           writeText("/proc/self/gid_map", "0 " + group + " 1");
}

// The programs and libraries of this machine, as they are.
bool bringIn(const fs::path& root, const std::string& name) {
    const fs::path source = "/" + name;
    const fs::path target = root / name;
    if (!fs::exists(fs::symlink_status(source))) {
        return true;
    }
    if (fs::is_symlink(source)) {
        fs::create_symlink(fs::read_symlink(source), target);
        return true;
    }
    fs::create_directory(target);
    return ::mount(source.c_str(), target.c_str(), nullptr, MS_BIND | MS_REC, nullptr) == 0;
}

bool enterMachine(const fs::path& root) {
    if (!enterNameSpaces() || ::mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0) {
        return false;
    }
    for (const char* name : {"usr", "bin", "sbin", "lib", "lib32", "lib64", "libx32"}) {
        if (!bringIn(root, name)) {
            return false;
        }
    }
    return ::chroot(root.c_str()) == 0 && ::chdir("/") == 0 && fs::exists("/usr/sbin/useradd");
}

// Runs `body` with the scratch directory as root; false when this machine does not allow it.
bool onOwnMachine(const std::function<void()>& body) {
    const ScratchDirectory scratch;
    EXPECT_TRUE(store::initRoot(scratch.path()).accepted);
    fs::create_directories(scratch.path() / "var/log");
    fs::create_directories(scratch.path() / "var/mail");
    std::cout.flush();
    const pid_t child = ::fork();
    if (child == 0) {
        if (!enterMachine(scratch.path())) {
            ::_exit(kCannotEnter);
        }
        body();
        EXPECT_THAT(findFaults("/"), IsEmpty());
        std::cout.flush();
        ::_exit(testing::Test::HasFailure() ? 1 : 0);
    }
    int status = -1;
    EXPECT_EQ(child, ::waitpid(child, &status, 0));
    EXPECT_TRUE(WIFEXITED(status));
    if (WEXITSTATUS(status) != kCannotEnter) {
        EXPECT_EQ(0, WEXITSTATUS(status)) << "see the failures above";
    }
    return WEXITSTATUS(status) != kCannotEnter;
}

// Runs a command on "/" and returns the tools that were run, with their arguments.
std::vector<std::string> toolsOf(const std::string& method,
                                 const std::vector<std::string>& arguments) {
    RecordingTools tools;
    const auto status =
        store::executeCommand("/", command(method, arguments), store::systemFiles(), tools);
    EXPECT_TRUE(status) << (status ? "" : status.reason());
    std::vector<std::string> lines;
    for (const RecordedCall& call : tools.calls()) {
        lines.push_back(call.tool() + call.line());
    }
    return lines;
}

void refuse(const std::string& method, const std::vector<std::string>& arguments) {
    EXPECT_FALSE(store::executeAdminCommand("/", command(method, arguments)).accepted) << method;
}

bool opens(const std::string& hash, const std::string& password) {
    crypt_data data{};
    const char* result = ::crypt_r(password.c_str(), hash.c_str(), &data);
    return result != nullptr && hash == result;
}

const char* const kNotAllowed = "this machine allows no name spaces or no change of the root";

} // namespace

TEST(SystemRoot, Sees_a_whole_life_through_the_tools_alone) {
    const bool entered = onOwnMachine([] {
        const std::string name = text("Name", "alice");
        EXPECT_THAT(
            toolsOf("CreateUser", {name, text("FullName", "Alice"), text("UserPassword", "one")}),
            ElementsAre("useradd --no-create-home --comment=Alice -- alice",
                        "chpasswd --encrypted"));
        EXPECT_TRUE(opens(lineOf("/etc/shadow", "alice").at(1), "one"));
        EXPECT_THAT(toolsOf("DisableUser", {name}), ElementsAre("usermod --lock -- alice"));
        EXPECT_THAT(toolsOf("SetPassword", {name, text("UserPassword", "two")}),
                    ElementsAre("chpasswd --encrypted"));
        EXPECT_EQ('!', lineOf("/etc/shadow", "alice").at(1).front());
        EXPECT_THAT(toolsOf("EnableUser", {name}), ElementsAre("usermod --unlock -- alice"));
        EXPECT_TRUE(opens(lineOf("/etc/shadow", "alice").at(1), "two"));
        EXPECT_THAT(toolsOf("CreateGroup", {text("Name", "devs"), number("GroupId", 2000)}),
                    ElementsAre("groupadd --gid=2000 -- devs"));
        EXPECT_THAT(
            toolsOf("ModifyUser", {name, number("UserID", 1500), number("GroupId", 2000),
                                   text("ScriptPath", "/bin/sh"), text("HomeDirectory", "/h")}),
            ElementsAre("usermod --home=/h --shell=/bin/sh --uid=1500 --gid=2000 -- alice"));
        EXPECT_THAT(lineOf("/etc/passwd", "alice"),
                    ElementsAre("alice", "x", "1500", "2000", "Alice", "/h", "/bin/sh"));
        EXPECT_THAT(
            toolsOf("ModifyUser",
                    {name, number("daysMustKeepPassword", 1),
                     number("daysMustChangePasswordAfter", 2),
                     number("daysWarnBeforePasswordExpire", 3), number("daysExpireAfter", 4),
                     dateTime("PasswordExpiration", "20300102030405.000000+000")}),
            ElementsAre("chage --mindays=1 --maxdays=2 --warndays=3 --inactive=4 "
                        "--expiredate=21916 -- alice"));
        const std::vector<std::string> shadow = lineOf("/etc/shadow", "alice");
        EXPECT_EQ((std::vector<std::string>{"1", "2", "3", "4", "21916", ""}),
                  std::vector<std::string>(shadow.begin() + 3, shadow.end()));
        EXPECT_THAT(toolsOf("AddMember", {text("Name", "users"), text("Member", "alice")}),
                    ElementsAre("gpasswd --add=alice -- users"));
        EXPECT_EQ("alice", lineOf("/etc/group", "users").at(3));
        EXPECT_THAT(toolsOf("RemoveMember", {text("Name", "users"), text("Member", "alice")}),
                    ElementsAre("gpasswd --delete=alice -- users"));
        EXPECT_EQ("", lineOf("/etc/group", "users").at(3));
        EXPECT_THAT(toolsOf("DeleteUser", {name}), ElementsAre("userdel -- alice"));
        EXPECT_THAT(toolsOf("DeleteGroup", {text("Name", "devs")}),
                    ElementsAre("groupdel -- devs"));
        EXPECT_THAT(lineOf("/etc/passwd", "alice"), IsEmpty());
        refuse("DeleteUser", {text("Name", "root")});
        refuse("DisableUser", {text("Name", "root")});
    });
    if (!entered) {
        GTEST_SKIP() << kNotAllowed;
    }
}

TEST(SystemRoot, Makes_and_removes_home_directories) {
    const bool entered = onOwnMachine([] {
        // An ordinary user's name space has no other users to give a directory to.
        if (::chown("/home", 1, 1) != 0) {
            std::cout << "not tried: only the superuser can give a directory away\n";
            return;
        }
        EXPECT_EQ(0, ::chown("/home", 0, 0));
        toolsOf("CreateGroup", {text("Name", "own"), number("GroupId", 1)});
        toolsOf("CreateUser", {text("Name", "alice"), number("UserID", 1), number("GroupId", 1),
                               number("CreateHome", 1)});
        EXPECT_TRUE(fs::exists("/home/alice/.profile"));
        toolsOf("ModifyUser", {text("Name", "alice"), number("UserID", 2)});
        struct stat status {};
        EXPECT_EQ(0, ::stat("/home/alice/.profile", &status));
        EXPECT_EQ(2u, status.st_uid);
        toolsOf("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
        EXPECT_TRUE(fs::is_empty("/home"));
    });
    if (!entered) {
        GTEST_SKIP() << kNotAllowed;
    }
}

TEST(SystemRoot, Removes_nothing_beyond_a_mount_point) {
    const bool entered = onOwnMachine([] {
        if (::chown("/home", 1, 1) != 0 || ::chown("/home", 0, 0) != 0) {
            std::cout << "not tried: only the superuser can give a directory away\n";
            return;
        }
        toolsOf("CreateGroup", {text("Name", "own"), number("GroupId", 1)});
        toolsOf("CreateUser", {text("Name", "alice"), number("UserID", 1), number("GroupId", 1),
                               number("CreateHome", 1)});
        fs::create_directories("/srv/shared/sub");
        write("/srv/shared/sub/file", "keep");
        fs::create_directories("/home/alice/mounted");
        ASSERT_EQ(0, ::mount("/srv/shared", "/home/alice/mounted", nullptr, MS_BIND, nullptr));
        // Whether anything was removed before the mount point was met decides between a refusal
        // and a rest that is left.
        const store::CommandOutcome outcome = store::executeAdminCommand(
            "/", command("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)}));
        EXPECT_EQ(outcome.accepted, lineOf("/etc/passwd", "alice").empty());
        EXPECT_EQ(outcome.accepted, outcome.status.find("is left at") != std::string::npos);
        EXPECT_EQ("keep", contentOf("/srv/shared/sub/file"));

        toolsOf("CreateUser", {text("Name", "bob"), number("UserID", 2), number("GroupId", 1)});
        fs::create_directory("/home/bob");
        ASSERT_EQ(0, ::chown("/srv/shared", 2, 1));
        ASSERT_EQ(0, ::mount("/srv/shared", "/home/bob", nullptr, MS_BIND, nullptr));
        refuse("DeleteUser", {text("Name", "bob"), number("RemoveHome", 1)});
        EXPECT_EQ("keep", contentOf("/srv/shared/sub/file"));
    });
    if (!entered) {
        GTEST_SKIP() << kNotAllowed;
    }
}

TEST(SystemRoot, Shares_the_lock_of_the_C_library) {
    const bool entered = onOwnMachine([] {
        using store::AccountFileLock;
        using std::chrono::milliseconds;
        store::FileSystem& files = store::systemFiles();
        const auto root = store::RootDirectory::open("/", files);
        ASSERT_TRUE(root && root->isSystemRoot());
        const pid_t holder = ::fork();
        if (holder == 0) {
            ::_exit(::lckpwdf() == 0 && ::kill(::getpid(), SIGSTOP) == 0 ? 0 : 1);
        }
        EXPECT_EQ(holder, ::waitpid(holder, nullptr, WUNTRACED));
        EXPECT_FALSE(AccountFileLock::take(*root, files, "shadow", milliseconds(100)));
        ::kill(holder, SIGKILL);
        EXPECT_EQ(holder, ::waitpid(holder, nullptr, 0));
        auto held = std::make_unique<store::Attempt<AccountFileLock>>(
            AccountFileLock::take(*root, files, "shadow", milliseconds(1000)));
        EXPECT_TRUE(*held);
        std::thread release([&] {
            std::this_thread::sleep_for(milliseconds(300));
            EXPECT_THAT(lineOf("/etc/passwd", "alice"), IsEmpty());
            held.reset();
        });
        toolsOf("CreateUser", {text("Name", "alice")});
        release.join();
    });
    if (!entered) {
        GTEST_SKIP() << kNotAllowed;
    }
}

TEST(SystemRoot, Is_as_it_was_after_any_tool_has_failed) {
    const bool entered = onOwnMachine([] {
        toolsOf("CreateUser", {text("Name", "zoe"), text("UserPassword", "pw")});
        toolsOf("AddMember", {text("Name", "users"), text("Member", "zoe")});
        const std::vector<std::string> lines{
            command("CreateUser", {text("Name", "alice"), text("UserPassword", "pw")}),
            command("ModifyUser", {text("Name", "zoe"), number("UserID", 1500),
                                   number("daysMustKeepPassword", 1), text("UserPassword", "pw")}),
            command("RemoveMember", {text("Name", "users"), text("Member", "zoe")}),
            command("DeleteUser", {text("Name", "zoe")})};
        const auto etcState = [] { return stateOf("/etc"); };
        for (const std::string& line : lines) {
            for (std::size_t call = 0; call < 3; ++call) {
                for (const auto fault :
                     {RecordingTools::Fault::Refuses, RecordingTools::Fault::FailsAfterwards}) {
                    RecordingTools tools;
                    tools.failAt(call, fault);
                    auto before = etcState();
                    const auto status =
                        store::executeCommand("/", line, store::systemFiles(), tools);
                    if (tools.calls().size() <= call) {
                        // There was no such call, so nothing had to fail.
                        continue;
                    }
                    EXPECT_FALSE(status) << line;
                    for (const char* name :
                         {"passwd", "shadow", "group", "gshadow", "subuid", "subgid"}) {
                        EXPECT_EQ(before[name], etcState()[name]) << line << " " << call;
                    }
                }
            }
        }
    });
    if (!entered) {
        GTEST_SKIP() << kNotAllowed;
    }
}

} // namespace qelo::test
