// What happens when memory runs out: every allocation of an operation fails in its turn.
#include "FailingNew.h"
#include "Scratch.h"

#include "logging/LoggerCore.h"
#include "platform/CvLogger.h"

#include <gtest/gtest.h>

#include <new>
#include <ostream>

namespace {

using namespace qelo::logging;
using namespace qelo::test;

constexpr int kMostAllocations = 10000;

// Runs `work` until it needs no allocation that fails; each failure may surface as bad_alloc
// and as nothing else. Gives how many allocations failed.
template <typename Work> int sweep(Work work) {
    int failures = 0;
    while (failures < kMostAllocations) {
        const FailingNew failing(failures + 1);
        try {
            work();
        } catch (const std::bad_alloc&) {
        }
        if (!failing.hasFailed()) {
            return failures;
        }
        ++failures;
    }
    return -1;
}

TEST(OutOfMemory, A_logger_gives_bad_alloc_or_loses_the_line) {
    const Scratch scratch;
    const std::string config = scratch.at("logging.conf");
    writeFile(config, "log = file:" + scratch.at("log") + "\nnonsense\nlog.level.a.b = 1\n");
    const int failures = sweep([&] {
        LoggerCore core(config, std::chrono::hours(1));
        core.write(Channel::Log, {"f", "u", 1, "a", 6000, "a message longer than a short string"});
    });
    EXPECT_GT(failures, 10);
    EXPECT_EQ(readFile(scratch.at("log")).back(), '\n');
}

TEST(OutOfMemory, A_configuration_that_could_not_be_read_is_read_the_next_time) {
    const Scratch scratch;
    const std::string config = scratch.at("logging.conf");
    writeFile(config, "log = none\n");
    LoggerCore core(config, std::chrono::seconds(0));
    writeFile(config, "log = stderr\nlog.level = 17\n");
    {
        const FailingNew failing(1);
        EXPECT_THROW(core.refreshIfDue(), std::bad_alloc);
    }
    core.refreshIfDue();
    EXPECT_EQ(core.admissionOf("a").thresholds[0], 17);
}

TEST(OutOfMemory, The_exported_logger_throws_nothing) {
    const Scratch scratch;
    writeFile(scratch.at("logging.conf"), "log = file:" + scratch.at("log") + "\n");
    const std::string component = "Corvane.A component with a name of some length";
    const std::string message = "a message longer than a short string";
    const auto run = [&] {
        ::setenv("QELO_LOG_CONFIG", scratch.at("logging.conf").c_str(), 1);
        const int failures = sweep([&] {
            try {
                CvLog::CvLogger::logLevelMessage("f", "u", 1, component, 6000, nullptr, 0, 0,
                                                 message);
            } catch (...) {
                std::exit(2);
            }
        });
        std::exit(failures > 10 ? 0 : 1);
    };
    EXPECT_EXIT(run(), testing::ExitedWithCode(0), "");
    EXPECT_NE(readFile(scratch.at("log")).find(message), std::string::npos);
}

TEST(OutOfMemory, A_message_buffer_gives_bad_alloc_and_leaks_nothing) {
    const std::string large(3000, 'x');
    const int failures = sweep([&] {
        CvLog::CvMessageBuffer first;
        CvLog::CvMessageBuffer second;
        first << large.c_str() << 5U;
        static_cast<std::ostream&>(second) << 7 << large;
        EXPECT_GE(first.str(first).size(), 3001U);
    });
    EXPECT_GT(failures, 3);
}

} // namespace
