// The texts of the trace formatters, byte for byte.
#include "support/platform/RecordingPlatform.h"

#include <UnitTrace.h>

#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <cstring>
#include <locale>
#include <map>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

namespace qelo::test {
namespace {

constexpr std::size_t longestLine = 511;

TEST(TraceFormat, The_kinds_of_line_keep_their_numbers) {
    EXPECT_EQ(Tesk::ENTERING, 0);
    EXPECT_EQ(Tesk::EXITING, 1);
    EXPECT_EQ(Tesk::METHOD, 2);
    EXPECT_EQ(Tesk::MESSAGE, 3);
}

TEST(TraceFormat, Each_kind_has_its_text) {
    EXPECT_STREQ(Tesk::trace("work", "Unit", 7, Tesk::ENTERING),
                 "ENTERING: work() in Unit [Line: 7]");
    EXPECT_STREQ(Tesk::trace("work", "Unit", 7, Tesk::EXITING),
                 "EXITING: work() in Unit [Line: 7]");
    EXPECT_STREQ(Tesk::trace("work", "Unit", 7, Tesk::METHOD),
                 "METHOD: work() was invoked in Unit [Line: 7]");
}

TEST(TraceFormat, A_MESSAGE_line_puts_the_unit_first_then_the_line_and_the_text_last) {
    EXPECT_STREQ(Tesk::trace("it failed", "Unit", 7, Tesk::MESSAGE),
                 "MESSAGE [File: Unit, Line: 7]: it failed");
}

TEST(TraceFormat, Type_7_yields_an_ENTERING_line) {
    EXPECT_STREQ(Tesk::trace("work", "Unit", 7, static_cast<Tesk::MessageType>(7)),
                 "ENTERING: work() in Unit [Line: 7]");
    EXPECT_STREQ(Tesk::tracepara("work", "Unit", 7, " a=1", static_cast<Tesk::MessageType>(7)),
                 "ENTERING: work() in Unit [Line: 7],Parameters List:  a=1");
    EXPECT_STREQ(Tesk::trace("work", "Unit", 7, static_cast<Tesk::MessageType>(-1)),
                 "ENTERING: work() in Unit [Line: 7]");
}

TEST(TraceFormat, Each_kind_has_its_text_with_parameters) {
    EXPECT_STREQ(Tesk::tracepara("work", "Unit", 7, " a=1 b=2", Tesk::ENTERING),
                 "ENTERING: work() in Unit [Line: 7],Parameters List:  a=1 b=2");
    EXPECT_STREQ(Tesk::tracepara("work", "Unit", 7, " a=1", Tesk::EXITING),
                 "EXITING: work() in Unit [Line: 7],Parameters List:  a=1");
    EXPECT_STREQ(Tesk::tracepara("work", "Unit", 7, " a=1", Tesk::METHOD),
                 "METHOD: work() was invoked in Unit [Line: 7],Parameters List:  a=1");
    EXPECT_STREQ(Tesk::tracepara("it failed", "Unit", 7, " a=1", Tesk::MESSAGE),
                 "MESSAGE [File: Unit, Line: 7]: it failed,Parameters List:  a=1");
}

TEST(TraceFormat, Two_blanks_stand_between_the_colon_and_the_first_parameter) {
    const std::string line = Tesk::tracepara("work", "Unit", 7, " name=alice", Tesk::ENTERING);
    EXPECT_NE(line.find("List:  name=alice"), std::string::npos) << line;
}

TEST(TraceFormat, A_variable_is_shown_as_number_or_text) {
    EXPECT_STREQ(Tesk::trace("count", "Unit", 7, 42U),
                 "VARIABLE: 'count' has Value '42' at line 7 in Unit");
    EXPECT_STREQ(Tesk::trace("name", "Unit", 7, "alice"),
                 "VARIABLE: 'name' has Value 'alice' at line 7 in Unit");
}

TEST(TraceFormat, Numbers_are_printed_signed) {
    EXPECT_STREQ(Tesk::trace("count", "Unit", 7, UINT_MAX),
                 "VARIABLE: 'count' has Value '-1' at line 7 in Unit");
    EXPECT_STREQ(Tesk::trace("count", "Unit", 7, 2147483648U),
                 "VARIABLE: 'count' has Value '-2147483648' at line 7 in Unit");
    EXPECT_STREQ(Tesk::trace("count", "Unit", 7, 2147483647U),
                 "VARIABLE: 'count' has Value '2147483647' at line 7 in Unit");
    EXPECT_STREQ(Tesk::trace("count", "Unit", 7, 0U),
                 "VARIABLE: 'count' has Value '0' at line 7 in Unit");
}

TEST(TraceFormat, Line_numbers_of_any_size_are_printed) {
    EXPECT_STREQ(Tesk::trace("w", "U", INT_MAX, Tesk::METHOD),
                 "METHOD: w() was invoked in U [Line: 2147483647]");
    EXPECT_STREQ(Tesk::trace("w", "U", INT_MIN, Tesk::METHOD),
                 "METHOD: w() was invoked in U [Line: -2147483648]");
}

TEST(TraceFormat, A_percent_sign_in_a_text_is_a_percent_sign) {
    EXPECT_STREQ(Tesk::trace("name", "Unit", 7, "%s%n%d"),
                 "VARIABLE: 'name' has Value '%s%n%d' at line 7 in Unit");
    EXPECT_STREQ(Tesk::trace("%n%n%s", "Unit", 7, Tesk::MESSAGE),
                 "MESSAGE [File: Unit, Line: 7]: %n%n%s");
}

TEST(TraceFormat, A_text_that_does_not_fit_is_cut_at_511_characters) {
    const std::string text(600, 'x');
    const std::string whole = "VARIABLE: 'name' has Value '" + text;
    EXPECT_EQ(Tesk::trace("name", "Unit", 7, text.c_str()), whole.substr(0, longestLine));
    EXPECT_EQ(std::strlen(Tesk::trace(text.c_str(), "Unit", 7, Tesk::MESSAGE)), longestLine);
    EXPECT_EQ(std::strlen(Tesk::trace(text.c_str(), "Unit", 7, 1U)), longestLine);
    EXPECT_EQ(std::strlen(Tesk::tracepara("work", "Unit", 7, text.c_str(), Tesk::EXITING)),
              longestLine);
}

TEST(TraceFormat, A_text_of_exactly_511_characters_is_whole) {
    const std::string frame = "MESSAGE [File: U, Line: 1]: ";
    const std::string text(longestLine - frame.size(), 'y');
    EXPECT_EQ(Tesk::trace(text.c_str(), "U", 1, Tesk::MESSAGE), frame + text);
}

TEST(TraceFormat, A_cut_line_leaves_nothing_behind_in_the_next) {
    Tesk::trace(std::string(600, 'x').c_str(), "Unit", 7, Tesk::MESSAGE);
    const char* line = Tesk::trace("a", "U", 1, Tesk::ENTERING);
    const std::string text = "ENTERING: a() in U [Line: 1]";
    ASSERT_EQ(line, text);
    for (std::size_t i = text.size(); i < longestLine + 1; ++i) {
        ASSERT_EQ(line[i], '\0') << "at " << i;
    }
}

TEST(TraceFormat, Each_formatter_has_one_buffer_of_its_own) {
    const char* plain = Tesk::trace("a", "U", 1, Tesk::ENTERING);
    const char* params = Tesk::tracepara("a", "U", 1, " p=", Tesk::ENTERING);
    const char* number = Tesk::trace("a", "U", 1, 1U);
    const char* text = Tesk::trace("a", "U", 1, "v");
    EXPECT_EQ(Tesk::trace("b", "U", 2, Tesk::EXITING), plain);
    EXPECT_EQ(Tesk::tracepara("b", "U", 2, " q=", Tesk::EXITING), params);
    EXPECT_EQ(Tesk::trace("b", "U", 2, 2U), number);
    EXPECT_EQ(Tesk::trace("b", "U", 2, "w"), text);
    EXPECT_EQ(std::vector<bool>({plain != params, plain != number, plain != text, params != number,
                                 params != text, number != text}),
              std::vector<bool>(6, true));
}

TEST(TraceFormat, A_missing_text_is_an_empty_one) {
    const char* none = nullptr;
    EXPECT_STREQ(Tesk::trace(none, "Unit", 7, Tesk::MESSAGE), "MESSAGE [File: Unit, Line: 7]: ");
    EXPECT_STREQ(Tesk::trace("name", none, 7, none), "VARIABLE: 'name' has Value '' at line 7 in ");
}

std::string streamed(const void* address) {
    std::ostringstream text;
    text << address;
    return text.str();
}

TEST(ParameterList, Addresses_look_as_a_stream_writes_them) {
    const int here = 0;
    for (const void* address :
         {static_cast<const void*>(&here), static_cast<const void*>(nullptr),
          reinterpret_cast<const void*>(std::uintptr_t{1}),
          reinterpret_cast<const void*>(std::uintptr_t{0x1000}),
          reinterpret_cast<const void*>(std::uintptr_t{0xfedcba9876543210})}) {
        EXPECT_EQ(Tesk::parameters(" at=", address, " end=", true),
                  " at=" + streamed(address) + " end=1");
    }
}

// Writes numbers in groups of three, as many languages do.
struct Grouped : std::numpunct<char> {
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
};

TEST(ParameterList, Addresses_look_as_a_stream_writes_them_in_another_locale) {
    const std::locale before =
        std::locale::global(std::locale(std::locale::classic(), new Grouped));
    const auto* address = reinterpret_cast<const void*>(std::uintptr_t{0x12345678});
    const std::string list = Tesk::parameters(" at=", address);
    const std::string expected = " at=" + streamed(address);
    std::locale::global(before);
    EXPECT_EQ(list, expected);
}

// A line that is raised while another is being made, as by a value that traces how it is read.
TEST(EmitLine, Lines_within_lines_keep_their_texts) {
    auto& platform = RecordingPlatform::instance();
    platform.reset();
    const std::string component = "Corvane.Test";
    const auto text = [](const char* message) { return [=] { return message; }; };
    const Tesk::LineText outer("outer");
    Tesk::emitLine("f", "U", 1, component, 3000, text("inner"));
    const std::string& held = outer;
    EXPECT_EQ(held, "outer");
    const auto lines = platform.lines();
    ASSERT_EQ(lines.size(), 2U);
    EXPECT_EQ(lines[0].message, "inner");
    EXPECT_EQ(lines[1].message, "inner");
}

TEST(EmitLine, Lines_of_many_threads_are_all_there) {
    auto& platform = RecordingPlatform::instance();
    platform.reset();
    constexpr int threadCount = 4;
    constexpr int linesEach = 200;
    std::vector<std::thread> threads;
    for (int i = 0; i < threadCount; ++i) {
        threads.emplace_back([text = std::string(40, static_cast<char>('a' + i))] {
            for (int line = 0; line < linesEach; ++line) {
                Tesk::emitLine("f", "U", line, "Corvane.Test", 3000, [&] { return text.c_str(); });
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    std::map<std::string, int> counts;
    for (const LogLine& line : platform.lines()) {
        ++counts[line.message];
    }
    EXPECT_EQ(counts.size(), static_cast<std::size_t>(threadCount));
    for (const auto& [text, count] : counts) {
        EXPECT_EQ(count, 2 * linesEach) << text;
    }
}

} // namespace
} // namespace qelo::test
