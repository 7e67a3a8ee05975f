// Running tools as processes.
#include "ToolRunner.h"
#include "CommandTest.h"

#include <array>
#include <csignal>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace qelo::test {

namespace {

using store::ToolCall;
using store::ToolResult;

// A tool of a test's own: a script with a fixed interpreter.
class Tool : public testing::Test {
protected:
    ToolResult run(const std::string& script, const std::vector<std::string>& arguments = {},
                   const std::string& input = "", int limit = 60) {
        ToolCall call;
        call.program = (scratch_.path() / "tool").native();
        write(call.program, "#!/bin/sh\n" + script);
        ::chmod(call.program.c_str(), 0755);
        call.arguments = arguments;
        call.input = store::Secret(input);
        call.limit = std::chrono::seconds(limit);
        return store::systemTools().run(call);
    }

    const ScratchDirectory scratch_;
};

// Changes what a signal does while it lives.
class WithSignal {
public:
    WithSignal(int signal, void (*handler)(int)) : signal_(signal) {
        struct sigaction action {};
        action.sa_handler = handler;
        ::sigaction(signal_, &action, &before_);
    }
    ~WithSignal() { ::sigaction(signal_, &before_, nullptr); }
    WithSignal(const WithSignal&) = delete;
    WithSignal& operator=(const WithSignal&) = delete;

private:
    int signal_;
    struct sigaction before_ {};
};

void reapEveryChild(int) {
    const int saved = errno;
    while (::waitpid(-1, nullptr, WNOHANG) > 0) {
    }
    errno = saved;
}

} // namespace

TEST_F(Tool, Reports_exit_status_and_message) {
    const ToolResult result = run("echo out; echo problem >&2; exit 7");
    EXPECT_EQ(ToolResult::End::Exited, result.end);
    EXPECT_EQ(7, result.code);
    EXPECT_EQ("out\nproblem\n", result.message);
    EXPECT_FALSE(result.done());
    EXPECT_TRUE(run("exit 0").done());
}

TEST_F(Tool, Gets_its_arguments_as_they_are) {
    const ToolResult result = run("for a; do echo \"[$a]\"; done",
                                  {"", "a b", "$(id)", "`id`", "; reboot", "*", "'\"\\", "-rf"});
    EXPECT_EQ("[]\n[a b]\n[$(id)]\n[`id`]\n[; reboot]\n[*]\n['\"\\]\n[-rf]\n", result.message);
}

TEST_F(Tool, Reads_its_input_to_the_end) {
    EXPECT_EQ("one\ntwo\n", run("cat", {}, "one\ntwo\n").message);
    EXPECT_EQ("", run("cat").message);
    EXPECT_EQ("2000\n", run("wc -c", {}, std::string(2000, 'x')).message);
}

TEST_F(Tool, That_never_reads_its_input_does_no_harm) {
    EXPECT_TRUE(run("exec <&-; exit 0", {}, std::string(4096, 'x')).done());
}

TEST_F(Tool, Is_not_started_with_more_input_than_a_pipe_holds) {
    EXPECT_EQ(ToolResult::End::NotStarted, run("exit 0", {}, std::string(4097, 'x')).end);
}

TEST_F(Tool, Sees_a_fixed_environment_and_directory) {
    ::setenv("QELO_SECRET", "leak", 1);
    ::setenv("LD_PRELOAD_NOT", "leak", 1);
    EXPECT_EQ("LC_ALL=C\nPATH=/usr/sbin:/usr/bin:/sbin:/bin\nPWD=/\n",
              run("/usr/bin/env | /usr/bin/grep -v '^_=' | /usr/bin/sort").message);
    ::unsetenv("QELO_SECRET");
    ::unsetenv("LD_PRELOAD_NOT");
    EXPECT_EQ("/\n0022\n", run("pwd; umask").message);
}

TEST_F(Tool, Has_the_three_standard_descriptors_only) {
    const int leak = ::open("/dev/null", O_RDONLY);
    const int high = ::fcntl(leak, F_DUPFD, 300);
    // The listing itself has one open for the directory it reads.
    EXPECT_EQ("0 1 2 3 ",
              run("cd /proc/self/fd; exec /usr/bin/printf '%s ' $(/bin/ls /proc/self/fd)").message);
    ::close(leak);
    ::close(high);
}

TEST_F(Tool, Has_default_signals_whatever_the_caller_does) {
    const WithSignal ignored(SIGPIPE, SIG_IGN);
    const WithSignal alsoIgnored(SIGTERM, SIG_IGN);
    sigset_t blocked;
    ::sigemptyset(&blocked);
    ::sigaddset(&blocked, SIGUSR1);
    sigset_t before;
    ::pthread_sigmask(SIG_BLOCK, &blocked, &before);
    const ToolResult result = run("/usr/bin/grep -E 'SigBlk|SigIgn' /proc/self/status");
    ::pthread_sigmask(SIG_SETMASK, &before, nullptr);
    EXPECT_EQ("SigBlk:\t0000000000000000\nSigIgn:\t0000000000000000\n", result.message);
}

TEST_F(Tool, Reports_its_status_to_a_caller_that_ignores_its_children) {
    const WithSignal ignored(SIGCHLD, SIG_IGN);
    EXPECT_EQ(7, run("exit 7").code);
    EXPECT_TRUE(run("exit 0").done());
}

TEST_F(Tool, Reports_its_status_to_a_caller_that_reaps_every_child) {
    const WithSignal handled(SIGCHLD, reapEveryChild);
    for (int i = 0; i < 20; ++i) {
        EXPECT_EQ(7, run("exit 7").code);
    }
}

TEST_F(Tool, Is_killed_with_its_children_when_its_time_is_over) {
    const auto start = std::chrono::steady_clock::now();
    const ToolResult result =
        run("trap '' TERM; sleep 60 & echo $! > " + (scratch_.path() / "pid").native() + "; wait",
            {}, "", 1);
    EXPECT_EQ(ToolResult::End::TimedOut, result.end);
    EXPECT_FALSE(result.done());
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
    const pid_t child = std::stoi(contentOf(scratch_.path() / "pid"));
    // Killed, it still needs a processor once to die on. Whoever inherits it reaps it, or has
    // not yet: then it is dead all the same.
    const auto isDead = [&] {
        const std::string status = contentOf("/proc/" + std::to_string(child) + "/status");
        return status.empty() || status.find("State:\tZ") != std::string::npos ||
               status.find("State:\tX") != std::string::npos;
    };
    const auto patience = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (!isDead() && std::chrono::steady_clock::now() < patience) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    EXPECT_TRUE(isDead());
}

TEST_F(Tool, That_was_killed_is_not_done) {
    const ToolResult result = run("kill -KILL $$");
    EXPECT_EQ(ToolResult::End::Killed, result.end);
    EXPECT_EQ(SIGKILL, result.code);
}

TEST_F(Tool, That_is_not_there_is_not_started) {
    ToolCall call;
    call.program = "/nonexistent/tool";
    const ToolResult result = store::systemTools().run(call);
    EXPECT_EQ(ToolResult::End::NotStarted, result.end);
    EXPECT_EQ(ENOENT, result.code);
    EXPECT_FALSE(result.done());
}

TEST_F(Tool, May_write_any_amount_of_which_the_beginning_is_kept) {
    const ToolResult result = run("i=0; while [ $i -lt 3000 ]; do echo "
                                  "0123456789012345678901234567890123456789 >&2; i=$((i+1)); done");
    EXPECT_TRUE(result.done());
    EXPECT_EQ(2000u, result.message.size());
}

TEST_F(Tool, Is_not_waited_for_longer_than_it_lives) {
    const auto start = std::chrono::steady_clock::now();
    EXPECT_TRUE(run("sleep 30 & exit 0").done());
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
}

TEST_F(Tool, Runs_in_many_threads_at_once) {
    write(scratch_.path() / "many", "#!/bin/sh\nexit $1\n");
    ::chmod((scratch_.path() / "many").c_str(), 0755);
    std::vector<std::thread> threads;
    std::array<int, 20> codes{};
    for (std::size_t i = 0; i < codes.size(); ++i) {
        threads.emplace_back([&, i] {
            ToolCall call;
            call.program = (scratch_.path() / "many").native();
            call.arguments = {std::to_string(i)};
            codes.at(i) = store::systemTools().run(call).code;
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (std::size_t i = 0; i < codes.size(); ++i) {
        EXPECT_EQ(static_cast<int>(i), codes.at(i));
    }
}

} // namespace qelo::test
