// Every system call of the write path made to fail, in qelosim and in the account tools that it
// runs: the database is then as before the command or as after it, and never between.
#include "HalfDone.h"
#include "SweepCount.h"
#include "SweptCommands.h"
#include "WatchedCommands.h"

#include "ScratchRoot.h"
#include "platform/commands/CommandTest.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <csignal>
#include <sys/prctl.h>
#include <sys/wait.h>

namespace qelo::test {
namespace {

using sweep::FaultWay;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

std::vector<int> errors() {
    return isLongSweep() ? std::vector<int>{EIO, ENOSPC, ENOMEM, EACCES, EINTR}
                         : std::vector<int>{EIO};
}

class SystemCallSweep : public testing::TestWithParam<WatchedCommand> {
protected:
    // Judges one run in which a call failed.
    void judge(const WatchedRun& run) {
        judgeEnd(run);
        judgeState(run);
        if (world_.state() != world_.before()) {
            world_.renew();
        }
    }

    // After its process was killed, a command may be half done, but no file is, and the next
    // commands find nothing in their way.
    void judgeKilled(const WatchedRun& run) {
        endOrphans();
        if (run.status != 128 + SIGKILL) {
            judgeEnd(run);
        }
        // A tool that is gone is a tool that has failed. Not so the process that watches over a
        // tool, which bears qelosim's name too: its end takes the tool along a moment later.
        if (run.failed.rfind("qelosim: ", 0) != 0) {
            judgeState(run);
        }
        judgeHalfDone(run);
    }

    // On a disk that is full to the end, what was changed before may not be put back; the
    // command says so then.
    void judgeFull(const WatchedRun& run) {
        const RootState now = world_.state();
        if (now == world_.before() || now == world_.after() || run.status == 0) {
            judge(run);
            return;
        }
        SCOPED_TRACE(describe(run));
        judgeEnd(run);
        EXPECT_THAT(run.said, HasSubstr("not undone"));
        EXPECT_THAT(run.said, Not(HasSubstr("nothing was changed")));
        judgeHalfDone(run);
    }

    // One call after the other meets with the fault, until the command is through before its
    // turn comes. With a step calls are left out, by each command others.
    template <class Judge> void faultEach(Fault fault, long step, long least, Judge judgeRun) {
        const long first = 1 + static_cast<long>(GetParam().name.size()) % step;
        for (long n = first;; n += step) {
            const WatchedRun run = world_.run(n, fault);
            if (run.failed.empty()) {
                EXPECT_EQ(run.status, 0) << run.said;
                EXPECT_EQ(world_.after(), world_.state());
                EXPECT_GT(n, least);
                world_.renew();
                return;
            }
            ++faults_;
            judgeRun(run);
        }
    }

    static std::string describe(const WatchedRun& run) {
        return run.failed + "; status " + std::to_string(run.status) + ": " + run.said;
    }

    static void SetUpTestSuite() { ::prctl(PR_SET_CHILD_SUBREAPER, 1); }

    WatchedWorld world_{GetParam()};
    std::size_t faults_ = 0;

private:
    static void judgeEnd(const WatchedRun& run) {
        SCOPED_TRACE(describe(run));
        EXPECT_TRUE(run.status >= 0 && run.status < 128);
        EXPECT_TRUE(isSane(run));
    }

    // It is the old or the new one.
    void judgeState(const WatchedRun& run) {
        SCOPED_TRACE(describe(run));
        const RootState now = world_.state();
        if (now.count("etc") != 0) {
            EXPECT_THAT(findFaults(world_.root()), IsEmpty());
        }
        if (run.status == 0) {
            EXPECT_EQ(world_.after(), WatchedWorld::withoutRests(now));
        } else if (now != world_.before()) {
            EXPECT_EQ(world_.after(), now);
            EXPECT_THAT(run.said, Not(HasSubstr("nothing was changed")));
        }
    }

    void judgeHalfDone(const WatchedRun& run) {
        SCOPED_TRACE(describe(run));
        if (GetParam().makesRoot) {
            judgeHalfMadeRoot();
        } else {
            EXPECT_THAT(findLosses(world_.state(), world_.before(), world_.after()), IsEmpty());
        }
        expectNothingInTheWay();
        world_.renew();
    }

    // Its etc appears complete or not at all, and whatever there is, it can be completed.
    void judgeHalfMadeRoot() {
        if (world_.state().count("etc") != 0) {
            EXPECT_THAT(findLosses(world_.state(), world_.after(), world_.after()), IsEmpty());
            return;
        }
        const store::CommandOutcome again = store::initRoot(world_.root());
        EXPECT_TRUE(again.accepted) << again.status;
        EXPECT_EQ(world_.after(), world_.state());
    }

    // These lock and write every account file.
    void expectNothingInTheWay() {
        for (const std::string& line : {command("CreateUser", {text("Name", "nextuser")}),
                                        command("CreateGroup", {text("Name", "nextgroup")})}) {
            const store::CommandOutcome next = store::executeAdminCommand(world_.root(), line);
            EXPECT_TRUE(next.accepted) << line << ": " << next.status;
        }
        EXPECT_THAT(findRests(world_.root()), IsEmpty());
    }

    // Processes that the killed one has left behind come to this one (see SetUpTestSuite).
    static void endOrphans() {
        while (::waitpid(-1, nullptr, 0) > 0 || errno == EINTR) {
        }
    }
};

TEST_P(SystemCallSweep, Any_call_may_fail_and_leaves_the_old_or_the_new_state) {
    for (const int error : errors()) {
        faultEach({FaultWay::Error, error}, isLongSweep() ? 1 : 11, 50,
                  [&](const WatchedRun& run) { judge(run); });
    }
    countFaults("system calls, " + GetParam().name, 1, faults_);
}

TEST_P(SystemCallSweep, Any_write_may_be_short_and_the_command_is_done_or_undone) {
    faultEach({FaultWay::Short, 0}, 1, 1, [&](const WatchedRun& run) { judge(run); });
    countFaults("short writes, " + GetParam().name, 1, faults_);
}

TEST_P(SystemCallSweep, The_disk_may_be_full_from_any_call_on) {
    faultEach({FaultWay::Full, ENOSPC}, isLongSweep() ? 1 : 2, 1,
              [&](const WatchedRun& run) { judgeFull(run); });
    countFaults("full disks, " + GetParam().name, 1, faults_);
}

TEST_P(SystemCallSweep, Any_call_may_be_the_last_of_its_process) {
    faultEach({FaultWay::Kill, 0}, isLongSweep() ? 1 : 31, 50,
              [&](const WatchedRun& run) { judgeKilled(run); });
    countFaults("killed at a system call, " + GetParam().name, 1, faults_);
}

INSTANTIATE_TEST_SUITE_P(Each, SystemCallSweep, testing::ValuesIn(sweptCommands()),
                         [](const auto& test) { return test.param.name; });

} // namespace
} // namespace qelo::test
