#include "ToolProcess.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <ctime>
#include <fcntl.h>
#include <sys/prctl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace qelo::store {

namespace {

constexpr int kReport = 3;
constexpr int kFirstSpare = 10;

void tell(ToolReport::Kind kind, int code) {
    const ToolReport report{kind, code};
    // A record this small is written whole or not at all; without it the parent sees a
    // failure, which is the right answer too.
    if (::write(kReport, &report, sizeof report) < 0) {
        ::_exit(126);
    }
}

void resetSignals() {
    for (int signal = 1; signal < NSIG; ++signal) {
        (void)::signal(signal, SIG_DFL);
    }
}

void closeFrom(unsigned first) {
    if (::close_range(first, ~0u, 0) == 0) {
        return;
    }
    const long end = ::sysconf(_SC_OPEN_MAX);
    for (int file = static_cast<int>(first); file < end; ++file) {
        ::close(file);
    }
}

// Puts the descriptors at 0 to 3 and closes all others. They are first moved out of the way
// of these numbers.
bool arrangeDescriptors(const ToolProcess& process) {
    const std::array<int, 4> wanted{process.input, process.error, process.error, process.report};
    std::array<int, 4> moved{};
    for (std::size_t i = 0; i < wanted.size(); ++i) {
        moved[i] = ::fcntl(wanted[i], F_DUPFD, kFirstSpare);
        if (moved[i] < 0) {
            return false;
        }
    }
    for (std::size_t i = 0; i < wanted.size(); ++i) {
        if (::dup2(moved[i], static_cast<int>(i)) < 0) {
            return false;
        }
    }
    closeFrom(kReport + 1);
    return true;
}

[[noreturn]] void becomeTool(const ToolProcess& process) {
    ::setpgid(0, 0);
    // Nobody would enforce the time limit or tell the end of a tool without a supervisor.
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    sigset_t none;
    ::sigemptyset(&none);
    ::sigprocmask(SIG_SETMASK, &none, nullptr);
    ::fcntl(kReport, F_SETFD, FD_CLOEXEC);
    ::execve(process.program, process.arguments, process.environment);
    tell(ToolReport::kNotStarted, errno);
    ::_exit(127);
}

// The time left until `end`, never negative.
timespec timeUntil(const timespec& end) {
    timespec now{};
    ::clock_gettime(CLOCK_MONOTONIC, &now);
    timespec left{end.tv_sec - now.tv_sec, end.tv_nsec - now.tv_nsec};
    if (left.tv_nsec < 0) {
        left.tv_sec -= 1;
        left.tv_nsec += 1000000000L;
    }
    return left.tv_sec < 0 ? timespec{0, 0} : left;
}

// Waits for the tool; false when its time ran out first. SIGCHLD is blocked and so stays
// pending until it is asked for.
bool waitWithin(pid_t tool, long seconds, int& status) {
    sigset_t childEnded;
    ::sigemptyset(&childEnded);
    ::sigaddset(&childEnded, SIGCHLD);
    timespec end{};
    ::clock_gettime(CLOCK_MONOTONIC, &end);
    end.tv_sec += seconds;
    while (true) {
        const pid_t ended = ::waitpid(tool, &status, WNOHANG);
        if (ended != 0) {
            return ended == tool;
        }
        const timespec left = timeUntil(end);
        if (left.tv_sec == 0 && left.tv_nsec == 0) {
            return false;
        }
        ::sigtimedwait(&childEnded, nullptr, &left);
    }
}

void killAndReap(pid_t tool) {
    int status = 0;
    ::kill(-tool, SIGKILL);
    ::kill(tool, SIGKILL);
    while (::waitpid(tool, &status, 0) < 0 && errno == EINTR) {
    }
}

void superviseChild(pid_t tool, long limitSeconds) {
    int status = 0;
    if (!waitWithin(tool, limitSeconds, status)) {
        killAndReap(tool);
        tell(ToolReport::kTimedOut, 0);
    } else if (WIFEXITED(status)) {
        tell(ToolReport::kExited, WEXITSTATUS(status));
    } else {
        tell(ToolReport::kKilled, WTERMSIG(status));
    }
}

} // namespace

void superviseTool(const ToolProcess& process) {
    resetSignals();
    if (!arrangeDescriptors(process) || ::chdir("/") != 0) {
        ::_exit(126);
    }
    ::umask(022);
    const pid_t tool = ::fork();
    if (tool == 0) {
        becomeTool(process);
    }
    if (tool < 0) {
        tell(ToolReport::kNotStarted, errno);
    } else {
        ::setpgid(tool, tool);
        superviseChild(tool, process.limitSeconds);
    }
    ::_exit(0);
}

} // namespace qelo::store
