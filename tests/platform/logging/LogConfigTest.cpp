#include "Scratch.h"

#include "logging/LogConfig.h"

#include <gmock/gmock.h>

#include <random>
#include <string>

namespace {

using namespace qelo::logging;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

Threshold logThreshold(const LogConfig& config, std::string_view component) {
    return config.of(Channel::Log).thresholdOf(component);
}

Threshold traceThreshold(const LogConfig& config, std::string_view component) {
    return config.of(Channel::Trace).thresholdOf(component);
}

TEST(LogConfig, Without_a_setting_the_log_admits_failures_to_syslog_and_the_trace_nothing) {
    const LogConfig config = parseConfig("");
    EXPECT_EQ(config.of(Channel::Log).target.kind, SinkKind::Syslog);
    EXPECT_EQ(logThreshold(config, "Corvane.Any"), 6000);
    EXPECT_EQ(config.of(Channel::Trace).target.kind, SinkKind::None);
    EXPECT_EQ(traceThreshold(config, "Corvane.Any"), kAdmitsNothing);
    EXPECT_THAT(config.problems, IsEmpty());
}

TEST(LogConfig, Every_kind_of_target_is_understood) {
    EXPECT_EQ(parseConfig("log = none").of(Channel::Log).target.kind, SinkKind::None);
    EXPECT_EQ(parseConfig("log = stderr").of(Channel::Log).target.kind, SinkKind::Stderr);
    EXPECT_EQ(parseConfig("trace=syslog").of(Channel::Trace).target.kind, SinkKind::Syslog);
    const SinkTarget file = parseConfig("trace = file:/var/log/a b#c").of(Channel::Trace).target;
    EXPECT_EQ(file.kind, SinkKind::File);
    EXPECT_EQ(file.path, "/var/log/a b#c");
}

TEST(LogConfig, A_component_inherits_along_the_dots_up_to_the_root) {
    const LogConfig config = parseConfig("log.level = 5000\n"
                                         "log.level.Corvane = 4000\n"
                                         "log.level.Corvane.Sim.Deep = 3000\n");
    EXPECT_EQ(logThreshold(config, "Corvane.Sim.Deep"), 3000);
    EXPECT_EQ(logThreshold(config, "Corvane.Sim.Deep.Below"), 3000);
    EXPECT_EQ(logThreshold(config, "Corvane.Sim.Deeper"), 4000);
    EXPECT_EQ(logThreshold(config, "Corvane.Sim"), 4000);
    EXPECT_EQ(logThreshold(config, "Corvane"), 4000);
    EXPECT_EQ(logThreshold(config, "CorvaneX"), 5000);
    EXPECT_EQ(logThreshold(config, ""), 5000);
}

TEST(LogConfig, Component_names_of_odd_shapes_end_at_the_root) {
    const LogConfig config = parseConfig("log.level = 1\nlog.level.a = 2\n");
    EXPECT_EQ(logThreshold(config, "."), 1);
    EXPECT_EQ(logThreshold(config, "..."), 1);
    EXPECT_EQ(logThreshold(config, ".a"), 1);
    EXPECT_EQ(logThreshold(config, "a."), 2);
    EXPECT_EQ(logThreshold(config, "a..b"), 2);
    EXPECT_EQ(logThreshold(config, std::string(100000, '.')), 1);
}

TEST(LogConfig, Log_and_trace_have_thresholds_of_their_own) {
    const LogConfig config = parseConfig("trace = stderr\ntrace.level = 0\nlog.level = off\n");
    EXPECT_EQ(traceThreshold(config, "x"), 0);
    EXPECT_EQ(logThreshold(config, "x"), kAdmitsNothing);
}

TEST(LogConfig, The_lowest_threshold_is_that_of_the_root_or_of_a_component) {
    const auto lowest = [](const char* text) {
        return parseConfig(text).of(Channel::Log).lowestThreshold();
    };
    EXPECT_EQ(lowest(""), kFailureLevel);
    EXPECT_EQ(lowest("log.level = 3000"), 3000);
    EXPECT_EQ(lowest("log.level.a.b = 4000\nlog.level.c = off"), 4000);
    EXPECT_EQ(lowest("log.level = off\nlog.level.a = 7000"), 7000);
    EXPECT_EQ(lowest("log = none\nlog.level.a = 0"), kAdmitsNothing);
}

TEST(LogConfig, A_channel_that_goes_nowhere_admits_nothing_whatever_its_level) {
    EXPECT_EQ(traceThreshold(parseConfig("trace.level = 0"), "x"), kAdmitsNothing);
    EXPECT_EQ(logThreshold(parseConfig("log = none\nlog.level.x = 0"), "x"), kAdmitsNothing);
}

TEST(LogConfig, A_setting_given_twice_has_the_later_value) {
    const LogConfig config = parseConfig("log.level.a=1\nlog.level=2\nlog.level.a=3\nlog.level=4");
    EXPECT_EQ(logThreshold(config, "a"), 3);
    EXPECT_EQ(logThreshold(config, "b"), 4);
}

TEST(LogConfig, Comments_blanks_and_foreign_line_ends_are_passed_over) {
    const LogConfig config =
        parseConfig("# log.level = 1\r\n\r\n  \t # x\r\n\tlog.level\t=  7 \r\n");
    EXPECT_EQ(logThreshold(config, "a"), 7);
    EXPECT_THAT(config.problems, IsEmpty());
}

TEST(LogConfig, An_unknown_setting_is_reported_with_its_line_and_the_others_count) {
    for (const char* key :
         {"color", "log.levels", "logs", "log.", "log.level.", "trace.Level", "tracelevel"}) {
        const LogConfig config =
            parseConfig("log.level = 1\n" + std::string(key) + " = 5\nlog.level.a = 2\n");
        ASSERT_THAT(config.problems, SizeIs(1)) << key;
        EXPECT_EQ(config.problems[0].line, 2U);
        EXPECT_THAT(config.problems[0].text, HasSubstr(key));
        EXPECT_EQ(logThreshold(config, "b"), 1);
        EXPECT_EQ(logThreshold(config, "a"), 2);
    }
}

TEST(LogConfig, What_is_no_level_is_reported_and_changes_nothing) {
    for (const char* value :
         {"", "abc", "-1", "+5", "99999999999", "3000x", "0x10", "1 2", "OFF"}) {
        const LogConfig config = parseConfig("log.level=" + std::string(value));
        ASSERT_THAT(config.problems, SizeIs(1)) << value;
        EXPECT_EQ(logThreshold(config, "a"), 6000) << value;
    }
}

TEST(LogConfig, What_is_no_target_is_reported_and_changes_nothing) {
    for (const char* value : {"", "file:", "file:x", "file:../x", "file:/", "file:/x/",
                              "file:/a\x01", "/var/log/x", "Syslog", "stdout", "file:/a\x7f"}) {
        const LogConfig config = parseConfig("log=" + std::string(value));
        ASSERT_THAT(config.problems, SizeIs(1)) << value;
        EXPECT_EQ(config.of(Channel::Log).target.kind, SinkKind::Syslog) << value;
    }
}

TEST(LogConfig, A_line_without_an_equals_sign_is_reported) {
    EXPECT_THAT(parseConfig("log.level 3000").problems, SizeIs(1));
}

TEST(LogConfig, An_over_long_line_is_reported_and_ignored_and_the_next_one_counts) {
    const std::string longest = "log.level=5" + std::string(1024 - 11, ' ');
    EXPECT_EQ(logThreshold(parseConfig(longest), "a"), 5);
    const LogConfig config = parseConfig(longest + " \nlog.level.b=7");
    ASSERT_THAT(config.problems, SizeIs(1));
    EXPECT_EQ(config.problems[0].line, 1U);
    EXPECT_EQ(logThreshold(config, "a"), 6000);
    EXPECT_EQ(logThreshold(config, "b"), 7);
}

TEST(LogConfig, Problems_are_counted_but_only_the_first_are_kept) {
    std::string text;
    for (int line = 0; line < 10000; ++line) {
        text += "x\n";
    }
    const LogConfig config = parseConfig(text);
    ASSERT_THAT(config.problems, SizeIs(21));
    EXPECT_EQ(config.problems.back().text, "9980 more problems");
}

TEST(LogConfig, A_problem_repeats_only_the_beginning_of_a_long_setting) {
    const LogConfig config = parseConfig(std::string(1000, 'y') + "=1");
    ASSERT_THAT(config.problems, SizeIs(1));
    EXPECT_LT(config.problems[0].text.size(), 120U);
}

TEST(LogConfig, The_number_of_components_is_bounded) {
    std::string text;
    for (int component = 0; component < 1025; ++component) {
        text += "log.level.c" + std::to_string(component) + "=1\n";
    }
    const LogConfig config = parseConfig(text + "log.level.c0=9\n");
    ASSERT_THAT(config.problems, SizeIs(1));
    EXPECT_EQ(config.problems[0].line, 1025U);
    EXPECT_EQ(logThreshold(config, "c1023"), 1);
    EXPECT_EQ(logThreshold(config, "c1024"), 6000);
    EXPECT_EQ(logThreshold(config, "c0"), 9);
}

TEST(LogConfig, Lines_of_a_file_are_gathered_unless_that_is_turned_off) {
    const LogConfig config = parseConfig("log.buffer = off\nlog = file:/l\ntrace = file:/t\n");
    EXPECT_FALSE(config.of(Channel::Log).target.buffered);
    EXPECT_TRUE(config.of(Channel::Trace).target.buffered);
    EXPECT_TRUE(parseConfig("log.buffer=off\nlog.buffer=on").of(Channel::Log).target.buffered);
}

TEST(LogConfig, A_buffer_is_on_or_off) {
    const LogConfig config = parseConfig("trace.buffer = 10\n");
    ASSERT_THAT(config.problems, SizeIs(1));
    EXPECT_EQ(config.problems[0].text, "neither on nor off: \"10\"");
    EXPECT_TRUE(config.of(Channel::Trace).target.buffered);
}

TEST(LogConfig, Two_channels_into_one_file_are_gathered_only_where_both_may_be) {
    const LogConfig config =
        parseConfig("log = file:/f\ntrace = file:/f\nlog.buffer = off\ntrace.buffer = on\n");
    EXPECT_FALSE(config.of(Channel::Log).target.buffered);
    EXPECT_FALSE(config.of(Channel::Trace).target.buffered);
}

// The shipped file shows the defaults as comments; each must be a setting once uncommented.
TEST(LogConfig, The_shipped_file_sets_nothing_and_shows_only_valid_settings) {
    EXPECT_THAT(parseConfig(qelo::test::readFile(SHIPPED_CONFIG)).problems, IsEmpty());
    int settings = 0;
    for (const std::string& line : qelo::test::linesOf(SHIPPED_CONFIG)) {
        ASSERT_TRUE(line.empty() || line.front() == '#') << line;
        if (line.size() > 1 && line[1] != ' ') {
            EXPECT_THAT(parseConfig(line.substr(1)).problems, IsEmpty()) << line;
            ++settings;
        }
    }
    EXPECT_EQ(settings, 8);
}

// Mutates texts made of the format's own pieces, which random bytes alone would never form.
TEST(LogConfig, No_text_is_more_than_ignored) {
    static constexpr const char* pieces[] = {"log",    "trace", ".level", ".",   "=",  " ",
                                             "\n",     "file:", "/x",     "off", "#",  "3000",
                                             "syslog", "\r",    "\xff",   "a.b", "\t", "-"};
    std::mt19937 random(20240501); // NOLINT(cert-msc32-c,cert-msc51-cpp): the same each time
    for (int round = 0; round < 20000; ++round) {
        std::string text;
        for (auto count = random() % 24; count > 0; --count) {
            text += pieces[random() % std::size(pieces)];
        }
        text += std::string(random() % 3, '\0');
        const LogConfig config = parseConfig(text);
        EXPECT_GE(logThreshold(config, "a.b"), 0);
        EXPECT_LE(config.problems.size(), 21U);
        for (const Problem& problem : config.problems) {
            EXPECT_FALSE(problem.text.empty());
        }
    }
}

} // namespace
