// Who waits for whom.
#include "AccountFileLock.h"
#include "AccountTable.h"
#include "CommandExecutor.h"
#include "CommandTest.h"
#include "PosixFileSystem.h"
#include "StoreLock.h"

#include <atomic>
#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace qelo::test {

namespace {

namespace fs = std::filesystem;

using std::chrono::milliseconds;
using store::AccountFileLock;
using store::RootDirectory;
using store::StoreLock;
using testing::HasSubstr;

class Lock : public CommandTest {
protected:
    Lock() : opened_(RootDirectory::open(root(), files_)) {}

    // The exit status and message of a tool run by hand.
    store::ToolResult byHand(const std::string& tool, std::vector<std::string> arguments) {
        store::ToolCall call;
        call.program = "/usr/sbin/" + tool;
        call.arguments = {"--prefix", root().native()};
        call.arguments.insert(call.arguments.end(), arguments.begin(), arguments.end());
        call.limit = std::chrono::seconds(60);
        return store::systemTools().run(call);
    }

    store::PosixFileSystem files_;
    store::Attempt<RootDirectory> opened_;
};

// A process that does nothing until it is told to end.
class Sleeper {
public:
    Sleeper() : child_(::fork()) {
        if (child_ == 0) {
            ::pause();
            ::_exit(0);
        }
    }
    ~Sleeper() { end(); }
    Sleeper(const Sleeper&) = delete;
    Sleeper& operator=(const Sleeper&) = delete;

    std::string number() const { return std::to_string(child_); }
    void end() {
        if (child_ > 0) {
            ::kill(child_, SIGKILL);
            ::waitpid(child_, nullptr, 0);
        }
        child_ = -1;
    }

private:
    pid_t child_;
};

} // namespace

TEST_F(Lock, Of_an_account_file_keeps_the_systems_tools_out) {
    for (const char* name : {"passwd", "shadow", "group", "gshadow"}) {
        std::atomic<bool> released{false};
        auto held = std::make_unique<store::Attempt<AccountFileLock>>(
            AccountFileLock::take(*opened_, files_, name, milliseconds(100)));
        ASSERT_TRUE(*held);
        const std::string before = contentOf(etc("passwd"));
        // The superuser's tool waits; an ordinary user's gives up at once.
        std::thread release([&] {
            std::this_thread::sleep_for(milliseconds(300));
            EXPECT_EQ(before, contentOf(etc("passwd")));
            released = true;
            held.reset();
        });
        const store::ToolResult result =
            byHand("useradd", {"--no-log-init", "--", std::string("u") + name});
        EXPECT_TRUE(released || !result.done()) << name;
        release.join();
        EXPECT_EQ(isSuperuser(), result.done()) << name << ": " << result.message;
        if (!isSuperuser()) {
            EXPECT_THAT(result.message, HasSubstr("cannot lock"));
        }
        EXPECT_FALSE(fs::exists(etc(std::string(name) + ".lock")));
    }
}

TEST_F(Lock, Of_a_tool_keeps_us_out) {
    const Sleeper holder;
    write(etc("shadow.lock"), holder.number() + std::string(1, '\0'));
    EXPECT_FALSE(AccountFileLock::take(*opened_, files_, "shadow", milliseconds(100)));
    EXPECT_TRUE(AccountFileLock::take(*opened_, files_, "passwd", milliseconds(100)));
    fs::remove(etc("shadow.lock"));
    EXPECT_TRUE(AccountFileLock::take(*opened_, files_, "shadow", milliseconds(100)));
}

TEST_F(Lock, Whose_holder_is_gone_is_taken_over) {
    Sleeper holder;
    write(etc("shadow.lock"), holder.number());
    holder.end();
    EXPECT_TRUE(AccountFileLock::take(*opened_, files_, "shadow", milliseconds(500)));
    write(etc("shadow.lock"), std::to_string(::getpid()));
    EXPECT_TRUE(AccountFileLock::take(*opened_, files_, "shadow", milliseconds(500)));
}

TEST_F(Lock, That_cannot_be_understood_counts_as_held) {
    for (const char* text : {"", "x", "0", "-5", "1"}) {
        write(etc("shadow.lock"), text);
        EXPECT_FALSE(AccountFileLock::take(*opened_, files_, "shadow", milliseconds(50))) << text;
    }
    fs::remove(etc("shadow.lock"));
}

namespace {

// Says what the tools say when they cannot write their number into a lock.
class FullDisk : public store::ToolRunner {
public:
    store::ToolResult run(const store::ToolCall&) override {
        ++runs;
        return {store::ToolResult::End::Exited, 10,
                "groupadd: /etc/group.7 file write error: No space left on device\n"
                "groupadd: cannot lock /etc/group; try again later.\n"};
    }

    int runs = 0;
};

} // namespace

TEST_F(Lock, That_cannot_be_made_is_not_waited_for) {
    FullDisk tools;
    EXPECT_FALSE(store::executeCommand(root(), command("CreateGroup", {text("Name", "devs")}),
                                       files_, tools));
    EXPECT_EQ(1, tools.runs);
}

TEST_F(Lock, A_command_waits_for_a_tool_that_holds_an_account_file) {
    Sleeper holder;
    write(etc("passwd.lock"), holder.number());
    std::thread release([&] {
        std::this_thread::sleep_for(milliseconds(300));
        fs::remove(etc("passwd.lock"));
    });
    accept("CreateUser", {text("Name", "alice")});
    release.join();
}

TEST_F(Lock, A_command_waits_for_another_command) {
    auto held = std::make_unique<store::Attempt<StoreLock>>(
        StoreLock::take(*opened_, files_, milliseconds(100)));
    ASSERT_TRUE(*held);
    EXPECT_FALSE(StoreLock::take(*opened_, files_, milliseconds(50)));
    std::atomic<bool> released{false};
    std::thread release([&] {
        std::this_thread::sleep_for(milliseconds(200));
        EXPECT_TRUE(passwd("alice").empty());
        released = true;
        held.reset();
    });
    accept("CreateUser", {text("Name", "alice")});
    EXPECT_TRUE(released);
    release.join();
}

TEST_F(Lock, Of_a_command_that_was_killed_is_free) {
    const pid_t child = ::fork();
    if (child == 0) {
        const auto held = StoreLock::take(*opened_, files_, milliseconds(100));
        ::kill(::getpid(), held ? SIGKILL : SIGTERM);
    }
    int status = 0;
    ASSERT_EQ(child, ::waitpid(child, &status, 0));
    ASSERT_EQ(SIGKILL, WTERMSIG(status));
    EXPECT_TRUE(StoreLock::take(*opened_, files_, milliseconds(100)));
}

TEST_F(Lock, On_a_removed_lock_file_is_not_taken_for_the_lock) {
    const int old = ::open(etc(".qelosim.lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    ASSERT_EQ(0, ::flock(old, LOCK_EX));
    std::thread replace([&] {
        std::this_thread::sleep_for(milliseconds(200));
        fs::remove(etc(".qelosim.lock"));
        ::close(old);
    });
    const auto held = StoreLock::take(*opened_, files_, milliseconds(5000));
    replace.join();
    ASSERT_TRUE(held);
    EXPECT_FALSE(StoreLock::take(*opened_, files_, milliseconds(50)));
}

TEST_F(Lock, File_that_is_something_else_is_refused) {
    const ScratchDirectory elsewhere;
    fs::create_symlink(elsewhere.path() / "target", etc(".qelosim.lock"));
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("lock file"));
    EXPECT_FALSE(fs::exists(elsewhere.path() / "target"));
    fs::remove(etc(".qelosim.lock"));
    fs::create_directory(etc(".qelosim.lock"));
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("lock file"));
    fs::remove(etc(".qelosim.lock"));
    ASSERT_EQ(0, ::mkfifo(etc(".qelosim.lock").c_str(), 0600));
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice")}), HasSubstr("lock file"));
    fs::remove(etc(".qelosim.lock"));
}

TEST_F(Lock, File_can_be_opened_by_its_owner_only) {
    const mode_t before = ::umask(0);
    accept("CreateUser", {text("Name", "alice")});
    ::umask(before);
    EXPECT_EQ(fs::perms::owner_read | fs::perms::owner_write,
              fs::status(etc(".qelosim.lock")).permissions());
}

TEST_F(Lock, Editing_keeps_owner_group_and_mode_and_leaves_no_draft) {
    const auto before = stateOf(root());
    ASSERT_FALSE(store::editLines(*opened_, files_, "shadow", [](store::Lines& lines) {
        lines.push_back("x:*:1::::::");
        return true;
    }));
    ASSERT_FALSE(store::editLines(*opened_, files_, "shadow", [](store::Lines& lines) {
        lines.pop_back();
        return true;
    }));
    EXPECT_EQ(before, stateOf(root()));
}

TEST_F(Lock, That_cannot_be_had_leaves_the_file_alone) {
    class WithoutLinks : public store::PosixFileSystem {
    public:
        bool link(int, const std::string&, const std::string&) override {
            errno = EPERM;
            return false;
        }
    };
    WithoutLinks files;
    const auto before = stateOf(root());
    EXPECT_TRUE(store::editLines(*opened_, files, "shadow", [](store::Lines& lines) {
        lines.clear();
        return true;
    }));
    EXPECT_EQ(before, stateOf(root()));
}

} // namespace qelo::test
