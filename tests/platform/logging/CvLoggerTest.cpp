// The exported logger. It reads its configuration once it is first used, so each case has a
// process of its own.
#include "Scratch.h"

#include "logging/LogListener.h"
#include "platform/CvLogger.h"

#include <gmock/gmock.h>

#include <cerrno>
#include <chrono>
#include <functional>
#include <thread>

#include <pthread.h>
#include <unistd.h>

namespace {

using namespace qelo::test;
using CvLog::CvLogger;
using testing::EndsWith;
using testing::HasSubstr;
using testing::MatchesRegex;
using testing::SizeIs;

void log(int level, const std::string& message, const std::string& component = "Corvane.A") {
    CvLogger::logLevelMessage("function", "Unit", 7, component, level, nullptr, 0, 0, message);
}

void trace(int level, const std::string& message) {
    CvLogger::traceLevelMessage("function", "Unit", 7, "Corvane.A", level, nullptr, 0, 0, message);
}

class CvLoggerTest : public testing::Test {
protected:
    CvLoggerTest() {
        base = "log = file:" + logPath + "\ntrace = file:" + tracePath + "\n";
        configure("");
    }

    void configure(const std::string& text) { writeFile(configPath, base + text); }

    // exit() and not _exit(), so that leaks and trouble of the process's end show.
    void inFreshProcess(const std::function<void()>& work) {
        const auto run = [&] {
            ::setenv("QELO_LOG_CONFIG", configPath.c_str(), 1);
            work();
            std::exit(testing::Test::HasFailure() ? 1 : 0);
        };
        EXPECT_EXIT(run(), testing::ExitedWithCode(0), "");
    }

    Scratch scratch;
    const std::string configPath = scratch.at("logging.conf");
    const std::string logPath = scratch.at("log");
    const std::string tracePath = scratch.at("trace");
    std::string base;
};

TEST_F(CvLoggerTest, A_line_reaches_the_log_where_its_level_is_admitted) {
    inFreshProcess([] {
        log(6000, "a failure");
        log(5999, "not admitted");
        trace(6000, "not admitted");
    });
    ASSERT_THAT(linesOf(logPath), SizeIs(1));
    EXPECT_THAT(linesOf(logPath)[0],
                MatchesRegex("[^ ]+ [[][0-9]+:[0-9]+[]] 6000 Corvane.A function[(][)] Unit:7 "
                             "a failure"));
    EXPECT_FALSE(std::filesystem::exists(tracePath));
}

TEST_F(CvLoggerTest, Log_and_trace_have_their_own_thresholds_per_component) {
    configure("log.level = off\nlog.level.Corvane.B = 1\ntrace.level.Corvane = 3000\n");
    inFreshProcess([] {
        log(9000, "A");
        log(3000, "B", "Corvane.B.C");
        trace(3000, "T");
    });
    ASSERT_THAT(linesOf(logPath), SizeIs(1));
    EXPECT_THAT(linesOf(logPath)[0], EndsWith(" B"));
    ASSERT_THAT(linesOf(tracePath), SizeIs(1));
}

TEST_F(CvLoggerTest, Null_names_are_tolerated) {
    inFreshProcess(
        [] { CvLogger::logLevelMessage(nullptr, nullptr, 0, "", 6000, nullptr, 0, 0, ""); });
    ASSERT_THAT(linesOf(logPath), SizeIs(1));
    EXPECT_THAT(linesOf(logPath)[0], EndsWith(" 6000 - -() -:0 "));
}

TEST_F(CvLoggerTest, A_message_cannot_forge_a_second_line) {
    inFreshProcess([] { log(6000, "x\n2024-01-01T00:00:00.000+00:00 forged"); });
    EXPECT_THAT(linesOf(logPath), SizeIs(1));
}

TEST_F(CvLoggerTest, The_error_number_of_the_caller_is_kept) {
    configure("trace = file:/nowhere/at/all\ntrace.level = 0\n");
    inFreshProcess([] {
        errno = 4711;
        log(6000, "first, with all that it starts");
        trace(6000, "to a file that does not open");
        EXPECT_EQ(errno, 4711);
    });
}

TEST_F(CvLoggerTest, A_change_of_the_configuration_counts_after_a_second_or_two) {
    configure("log.level = off\n");
    inFreshProcess([this] {
        log(6000, "not yet");
        configure("log.level = 6000\n");
        const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(10);
        while (!std::filesystem::exists(logPath) && std::chrono::steady_clock::now() < end) {
            log(6000, "now");
        }
    });
    EXPECT_THAT(readFile(logPath), HasSubstr(" now\n"));
}

TEST_F(CvLoggerTest, Lines_of_many_threads_all_arrive_whole) {
    inFreshProcess([] {
        std::vector<std::thread> threads;
        for (int thread = 0; thread < 4; ++thread) {
            threads.emplace_back([] {
                for (int line = 0; line < 250; ++line) {
                    log(3000, "not admitted");
                    log(6000, std::string(300, 'x'));
                }
            });
        }
        for (std::thread& thread : threads) {
            thread.join();
        }
    });
    const auto lines = linesOf(logPath);
    ASSERT_THAT(lines, SizeIs(1000));
    for (const std::string& line : lines) {
        ASSERT_THAT(line, EndsWith(" " + std::string(300, 'x')));
    }
}

void* logWhileBeingCancelled(void* lines) {
    // The request waits for a place where it may take effect; logging must not be one.
    ::pthread_cancel(::pthread_self());
    for (int line = 0; line < 3; ++line) {
        log(6000, "still here");
        ++*static_cast<int*>(lines);
    }
    return nullptr;
}

TEST_F(CvLoggerTest, Logging_is_no_place_where_a_thread_is_cancelled) {
    inFreshProcess([] {
        int lines = 0;
        pthread_t thread{};
        ASSERT_EQ(::pthread_create(&thread, nullptr, logWhileBeingCancelled, &lines), 0);
        ::pthread_join(thread, nullptr);
        EXPECT_EQ(lines, 3);
    });
    EXPECT_THAT(linesOf(logPath), SizeIs(3));
}

TEST_F(CvLoggerTest, A_log_on_a_full_disk_stops_nothing) {
    base = "log = file:/dev/full\n";
    configure("");
    inFreshProcess([] {
        for (int line = 0; line < 100; ++line) {
            log(6000, "lost");
        }
    });
}

struct Overheard {
    std::vector<std::string> lines;

    static void listen(void* context, const char* component, int level, const char* message) {
        static_cast<Overheard*>(context)->lines.push_back(std::string(component) + " " +
                                                          std::to_string(level) + " " + message);
    }
};

TEST_F(CvLoggerTest, A_listener_is_told_of_lines_that_go_nowhere_else) {
    configure("log.level = off\ntrace.level = 0\n");
    inFreshProcess([] {
        Overheard overheard;
        log(6000, "before");
        qelo_setLogListener(Overheard::listen, &overheard);
        log(6000, "first");
        trace(6000, "not of the log");
        log(3000, "second", "Qelo.B");
        qelo_setLogListener(nullptr, nullptr);
        log(6000, "after");
        EXPECT_THAT(overheard.lines,
                    testing::ElementsAre("Corvane.A 6000 first", "Qelo.B 3000 second"));
    });
    EXPECT_FALSE(std::filesystem::exists(logPath));
    EXPECT_THAT(linesOf(tracePath), SizeIs(1));
}

TEST_F(CvLoggerTest, A_listener_takes_nothing_from_the_log) {
    inFreshProcess([] {
        Overheard overheard;
        qelo_setLogListener(Overheard::listen, &overheard);
        log(6000, "kept");
        qelo_setLogListener(nullptr, nullptr);
    });
    EXPECT_THAT(linesOf(logPath), SizeIs(1));
}

TEST_F(CvLoggerTest, A_listener_hears_its_own_thread_only) {
    inFreshProcess([] {
        Overheard overheard;
        qelo_setLogListener(Overheard::listen, &overheard);
        std::thread([] { log(6000, "elsewhere"); }).join();
        log(6000, "here");
        qelo_setLogListener(nullptr, nullptr);
        EXPECT_THAT(overheard.lines, testing::ElementsAre("Corvane.A 6000 here"));
    });
}

} // namespace
