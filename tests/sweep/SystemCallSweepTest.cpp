// Every system call of the write path made to fail, in qelosim and in the account tools that it
// runs: the database is then as before the command or as after it, and never between.
#include "SweepCount.h"
#include "WatchedCommands.h"

#include "platform/commands/CommandTest.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <sstream>
#include <sys/prctl.h>
#include <sys/wait.h>

namespace qelo::test {
namespace {

using testing::IsEmpty;

// An ordinary user can only make home directories that are his own.
long ownUser() { return isSuperuser() ? 4000 : static_cast<long>(::getuid()); }
long ownGroup() { return isSuperuser() ? 4000 : static_cast<long>(::getgid()); }

std::vector<WatchedCommand> commands() {
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
            {"RemoveMember", {user, other, member}, {"remove-member", "users", "alice"}, ""}};
}

std::vector<int> errors() {
    return isLongSweep() ? std::vector<int>{EIO, ENOSPC, ENOMEM, EACCES, EINTR}
                         : std::vector<int>{EIO};
}

class SystemCallSweep : public testing::TestWithParam<WatchedCommand> {
protected:
    // Judges one run in which a call failed.
    void judge(const WatchedRun& run) {
        SCOPED_TRACE(run.failed + "; status " + std::to_string(run.status) + ": " + run.said);
        EXPECT_TRUE(run.status >= 0 && run.status < 128);
        EXPECT_THAT(findFaults(world_.root()), IsEmpty());
        const WatchedWorld::State now = world_.state();
        if (run.status == 0) {
            EXPECT_EQ(world_.after(), WatchedWorld::withoutRests(now));
        } else if (now != world_.before()) {
            EXPECT_EQ(world_.after(), now);
            EXPECT_THAT(run.said, Not(testing::HasSubstr("nothing was changed")));
        }
        if (now != world_.before()) {
            world_.renew();
        }
    }

    // One call after the other fails, or ends its process for an error of 0, until the command
    // is through before its turn comes. The short form leaves calls out, each command others.
    template <class Judge> void failEach(int error, long step, Judge judgeRun) {
        const long first = 1 + static_cast<long>(GetParam().name.size()) % step;
        for (long n = first;; n += step) {
            const WatchedRun run = world_.run(n, n, error);
            if (run.failed.empty()) {
                EXPECT_EQ(run.status, 0) << run.said;
                EXPECT_EQ(world_.after(), world_.state());
                EXPECT_GT(n, 50);
                world_.renew();
                return;
            }
            ++faults_;
            judgeRun(run);
        }
    }

    // After its process was killed, a command may be half done, but no file is, and the next
    // command finds nothing in its way.
    void judgeKilled(const WatchedRun& run) {
        SCOPED_TRACE(run.failed + " killed; status " + std::to_string(run.status) + ": " +
                     run.said);
        endOrphans();
        expectWholeLines();
        const store::CommandOutcome next = store::executeAdminCommand(
            world_.root(), command("CreateGroup", {text("Name", "next")}));
        EXPECT_TRUE(next.accepted) << next.status;
        world_.renew();
    }

    // Processes that the killed one has left behind come to this one (see SetUpTestSuite).
    static void endOrphans() {
        while (::waitpid(-1, nullptr, 0) > 0 || errno == EINTR) {
        }
    }

    void expectWholeLines() {
        const std::map<std::string, std::size_t> fields = {{"passwd", 7}, {"shadow", 9},
                                                           {"group", 4},  {"gshadow", 4},
                                                           {"subuid", 3}, {"subgid", 3}};
        for (const auto& [file, count] : fields) {
            std::istringstream lines(contentOf(world_.root() / "etc" / file));
            for (std::string line; std::getline(lines, line);) {
                EXPECT_FALSE(lines.eof()) << "no newline at the end of " << file;
                const auto colons = std::count(line.begin(), line.end(), ':');
                EXPECT_EQ(static_cast<std::size_t>(colons) + 1, count) << file << ": " << line;
            }
        }
    }

    static void SetUpTestSuite() { ::prctl(PR_SET_CHILD_SUBREAPER, 1); }

    WatchedWorld world_{GetParam()};
    std::size_t faults_ = 0;
};

TEST_P(SystemCallSweep, Any_call_may_fail_and_leaves_the_old_or_the_new_state) {
    for (const int error : errors()) {
        failEach(error, isLongSweep() ? 1 : 4, [&](const WatchedRun& run) { judge(run); });
    }
    countFaults("system calls, " + GetParam().name, 1, faults_);
}

TEST_P(SystemCallSweep, Any_call_may_be_the_last_of_its_process) {
    failEach(0, isLongSweep() ? 1 : 16, [&](const WatchedRun& run) { judgeKilled(run); });
    countFaults("killed at a system call, " + GetParam().name, 1, faults_);
}

INSTANTIATE_TEST_SUITE_P(Each, SystemCallSweep, testing::ValuesIn(commands()),
                         [](const auto& test) { return test.param.name; });

} // namespace
} // namespace qelo::test
