#include "Scratch.h"

#include "logging/LoggerCore.h"

#include <gmock/gmock.h>

#include <thread>

#include <sys/stat.h>
#include <unistd.h>

namespace {

using namespace qelo::logging;
using namespace qelo::test;
using namespace std::chrono_literals;
using testing::EndsWith;
using testing::HasSubstr;
using testing::SizeIs;

class LoggerCoreTest : public testing::Test {
protected:
    void configure(const std::string& text) { writeFile(config, text); }

    // A configuration whose log is the file `log` and admits everything.
    std::string logToFile() const { return "log = file:" + log + "\nlog.level = 0\n"; }

    static Threshold threshold(LoggerCore& core, Channel channel,
                               std::string_view component = "a") {
        return core.admissionOf(component).thresholds[static_cast<std::size_t>(channel)];
    }

    static Line line(std::string_view message, int level = 6000) {
        return {"f", "u", 1, "a", level, message};
    }

    Scratch scratch;
    const std::string config = scratch.at("logging.conf");
    const std::string log = scratch.at("log");
    const std::string trace = scratch.at("trace");
};

TEST_F(LoggerCoreTest, Without_a_file_the_defaults_hold) {
    LoggerCore core(config, 0s);
    EXPECT_EQ(threshold(core, Channel::Log), 6000);
    EXPECT_EQ(threshold(core, Channel::Trace), kAdmitsNothing);
}

TEST_F(LoggerCoreTest, A_changed_file_counts_and_a_removed_one_gives_back_the_defaults) {
    configure(logToFile());
    LoggerCore core(config, 0s);
    EXPECT_EQ(threshold(core, Channel::Log), 0);
    const std::uint32_t before = core.generation();

    configure(logToFile() + "log.level.a = 4711\n");
    core.refreshIfDue();
    EXPECT_EQ(threshold(core, Channel::Log), 4711);
    EXPECT_NE(core.generation(), before);

    std::filesystem::remove(config);
    core.refreshIfDue();
    EXPECT_EQ(threshold(core, Channel::Log), 6000);
}

TEST_F(LoggerCoreTest, A_change_that_moves_neither_size_nor_time_is_noticed) {
    configure(logToFile() + "log.level.a = 1111\n");
    LoggerCore core(config, 0s);
    std::ofstream(config) << logToFile() << "log.level.a = 2222\n";
    core.refreshIfDue();
    EXPECT_EQ(threshold(core, Channel::Log), 2222);
}

TEST_F(LoggerCoreTest, An_unchanged_file_is_no_new_configuration) {
    configure(logToFile());
    LoggerCore core(config, 0s);
    const std::uint32_t before = core.generation();
    core.refreshIfDue();
    core.refreshIfDue();
    EXPECT_EQ(core.generation(), before);
}

TEST_F(LoggerCoreTest, The_file_is_looked_at_once_in_an_interval_only) {
    configure(logToFile());
    LoggerCore core(config, 1h);
    configure(logToFile() + "log.level.a = 4711\n");
    core.refreshIfDue();
    EXPECT_EQ(threshold(core, Channel::Log), 0);
}

TEST_F(LoggerCoreTest, Log_and_trace_go_to_their_own_files) {
    configure(logToFile() + "trace = file:" + trace + "\n");
    LoggerCore core(config, 1h);
    core.write(Channel::Log, line("to the log"));
    core.write(Channel::Trace, line("to the trace"));
    EXPECT_THAT(readFile(log), EndsWith(" to the log\n"));
    EXPECT_THAT(readFile(trace), EndsWith(" to the trace\n"));
}

TEST_F(LoggerCoreTest, Log_and_trace_in_one_file_keep_their_order) {
    configure(logToFile() + "trace = file:" + log + "\ntrace.level = 0\n");
    LoggerCore core(config, 1h);
    core.write(Channel::Trace, line("progress", 3000));
    core.write(Channel::Log, line("more progress", 3000));
    core.write(Channel::Log, line("failure", 6000));
    const auto lines = linesOf(log);
    ASSERT_THAT(lines, SizeIs(3));
    EXPECT_THAT(lines[0], EndsWith(" progress"));
    EXPECT_THAT(lines[1], EndsWith(" more progress"));
    EXPECT_THAT(lines[2], EndsWith(" failure"));
}

TEST_F(LoggerCoreTest, Problems_are_told_once_on_the_log_with_their_line) {
    configure(logToFile() + "nonsense\nlog.level.x = many\n");
    LoggerCore core(config, 0s);
    core.refreshIfDue();
    const auto lines = linesOf(log);
    ASSERT_THAT(lines, SizeIs(2));
    EXPECT_THAT(lines[0], HasSubstr("logging.conf:3: no \"=\" in \"nonsense\""));
    EXPECT_THAT(lines[1], HasSubstr("logging.conf:4: not a level: \"many\""));
}

TEST_F(LoggerCoreTest, A_problem_cannot_forge_a_line_of_the_log) {
    configure(logToFile() + "a\x1b]0;x\x07 = \r1\n");
    LoggerCore core(config, 1h);
    ASSERT_THAT(linesOf(log), SizeIs(1));
    EXPECT_THAT(readFile(log), HasSubstr("\\x1b]0;x\\x07"));
}

TEST_F(LoggerCoreTest, A_configuration_that_everybody_can_write_is_not_used) {
    configure("log.level = 1\n");
    ASSERT_EQ(::chmod(config.c_str(), 0666), 0);
    LoggerCore core(config, 0s);
    EXPECT_EQ(threshold(core, Channel::Log), 6000);
    ASSERT_EQ(::chmod(config.c_str(), 0600), 0);
    core.refreshIfDue();
    EXPECT_EQ(threshold(core, Channel::Log), 1);
}

TEST_F(LoggerCoreTest, A_configuration_of_another_user_is_not_used) {
    configure("log.level = 1\n");
    if (::geteuid() != 0 || ::chown(config.c_str(), 65534, 65534) != 0) {
        GTEST_SKIP() << "only root can give a file away";
    }
    LoggerCore core(config, 0s);
    EXPECT_EQ(threshold(core, Channel::Log), 6000);
}

TEST_F(LoggerCoreTest, A_configuration_that_is_no_regular_file_or_too_large_is_not_used) {
    ASSERT_EQ(::mkfifo(config.c_str(), 0600), 0);
    LoggerCore core(config, 0s);
    EXPECT_EQ(threshold(core, Channel::Log), 6000);
    std::filesystem::remove(config);
    std::filesystem::create_directory(config);
    core.refreshIfDue();
    EXPECT_EQ(threshold(core, Channel::Log), 6000);
    std::filesystem::remove(config);
    configure("log.level = 1\n" + std::string(300UL * 1024, '\n'));
    core.refreshIfDue();
    EXPECT_EQ(threshold(core, Channel::Log), 6000);
}

TEST_F(LoggerCoreTest, A_trace_that_cannot_be_written_is_told_on_the_log_once) {
    configure(logToFile() + "trace = file:/dev/full\n");
    LoggerCore core(config, 1h);
    core.write(Channel::Trace, line("lost"));
    core.write(Channel::Trace, line("lost"));
    const auto lines = linesOf(log);
    ASSERT_THAT(lines, SizeIs(1));
    EXPECT_THAT(lines[0], HasSubstr("lines for /dev/full are lost: No space left on device"));
}

TEST_F(LoggerCoreTest, A_log_that_cannot_be_written_stops_nothing) {
    configure("log = file:/dev/full\ntrace = file:/nowhere/at/all\nnonsense\n");
    LoggerCore core(config, 1h);
    EXPECT_NO_THROW(core.write(Channel::Log, line("lost")));
    EXPECT_NO_THROW(core.write(Channel::Trace, line("lost")));
}

TEST_F(LoggerCoreTest, Lines_written_while_the_configuration_changes_are_all_there) {
    configure(logToFile());
    LoggerCore core(config, 0s);
    constexpr int writers = 3;
    constexpr int lines = 200;
    std::vector<std::thread> threads;
    for (int writer = 0; writer < writers; ++writer) {
        threads.emplace_back([&core] {
            for (int count = 0; count < lines; ++count) {
                core.refreshIfDue();
                core.admissionOf("a");
                core.write(Channel::Log, line("text"));
            }
        });
    }
    for (int change = 0; change < 50; ++change) {
        configure(logToFile() + "log.level.x = " + std::to_string(change) + "\n");
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_THAT(linesOf(log), SizeIs(writers * lines));
}

} // namespace
