#include "logging/LineFormat.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <random>
#include <string>

#include <unistd.h>

namespace {

using namespace qelo::logging;
using testing::EndsWith;

std::string escaped(std::string_view text, Blanks blanks = Blanks::Kept, std::size_t limit = 1000) {
    std::string out;
    appendEscaped(out, text, limit, blanks);
    return out;
}

Line lineOf(std::string_view message) {
    return {"getName", "SimAccount", 42, "Corvane.X", 4000, message};
}

TEST(LineFormat, A_line_names_process_level_component_function_file_and_message) {
    const std::string ids =
        "[" + std::to_string(::getpid()) + ":" + std::to_string(::gettid()) + "]";
    EXPECT_EQ(formatLine(lineOf("a message")),
              ids + " 4000 Corvane.X getName() SimAccount:42 a message");
}

TEST(LineFormat, Missing_names_leave_no_field_empty) {
    const std::string line = formatLine({nullptr, nullptr, -1, "", 0, ""});
    EXPECT_THAT(line, EndsWith("] 0 - -() -:-1 "));
    EXPECT_THAT(formatLine({"", "", 1, "c", 0, "m"}), EndsWith("] 0 c -() -:1 m"));
}

TEST(LineFormat, Line_ends_and_tabs_appear_as_escapes) {
    EXPECT_EQ(escaped("a\nb\rc\td"), "a\\nb\\rc\\td");
}

TEST(LineFormat, A_backslash_is_doubled_so_that_escapes_cannot_be_feigned) {
    EXPECT_EQ(escaped("\\n"), "\\\\n");
}

TEST(LineFormat, Control_characters_of_all_kinds_appear_as_escapes) {
    using namespace std::string_view_literals;
    EXPECT_EQ(escaped("\0\x1b[31m\x7f"sv), "\\x00\\x1b[31m\\x7f");
    EXPECT_EQ(escaped("\xc2\x85\xc2\x9b"), "\\u{0085}\\u{009b}");
}

TEST(LineFormat, Characters_that_break_or_turn_a_line_appear_as_escapes) {
    EXPECT_EQ(escaped("\u2028\u2029\u202e\u2066\u200f\u061c"),
              "\\u{2028}\\u{2029}\\u{202e}\\u{2066}\\u{200f}\\u{061c}");
}

TEST(LineFormat, Text_of_any_script_stays_as_it_is) {
    const std::string text = "M\u00fcller \u7c21\u6613 \U0001F600 \u00a0";
    EXPECT_EQ(escaped(text), text);
}

TEST(LineFormat, Bytes_that_are_not_UTF_8_appear_as_escapes) {
    EXPECT_EQ(escaped("a\xff\xfe"), "a\\xff\\xfe");
    EXPECT_EQ(escaped("\xc0\xaf"), "\\xc0\\xaf");                   // overlong
    EXPECT_EQ(escaped("\xed\xa0\x80"), "\\xed\\xa0\\x80");          // a surrogate
    EXPECT_EQ(escaped("\xf4\x90\x80\x80"), "\\xf4\\x90\\x80\\x80"); // too large
    EXPECT_EQ(escaped("x\xe7\xb0"), "x\\xe7\\xb0");                 // truncated
}

TEST(LineFormat, A_blank_in_a_name_cannot_begin_another_field) {
    EXPECT_THAT(formatLine({"f g", "a b", 1, "c d", 1, "e f"}),
                EndsWith("] 1 c\\x20d f\\x20g() a\\x20b:1 e f"));
}

TEST(LineFormat, A_long_text_is_cut_and_says_so) {
    EXPECT_EQ(escaped("12345678", Blanks::Kept, 8), "12345678");
    EXPECT_EQ(escaped("123456789", Blanks::Kept, 8), "12345678...");
    EXPECT_EQ(escaped("123456\n9", Blanks::Kept, 7), "123456...");
    EXPECT_EQ(escaped("123456\u7c21", Blanks::Kept, 8), "123456...");
    EXPECT_EQ(escaped("x", Blanks::Kept, 0), "...");
}

TEST(LineFormat, A_line_has_a_bounded_length_whatever_it_is_made_of) {
    const std::string huge(3000000, '\n');
    const std::string line = formatLine({huge.c_str(), huge.c_str(), 1, huge, 1, huge});
    EXPECT_LT(line.size(), 40000U);
    EXPECT_THAT(line, EndsWith("..."));
}

TEST(LineFormat, No_message_can_make_a_second_line_or_drive_a_terminal) {
    std::mt19937 random(7); // NOLINT(cert-msc32-c,cert-msc51-cpp): the same each time
    for (int round = 0; round < 5000; ++round) {
        std::string message(random() % 40, '\0');
        std::generate(message.begin(), message.end(), [&] { return static_cast<char>(random()); });
        const std::string line = formatLine(lineOf(message));
        EXPECT_TRUE(std::none_of(line.begin(), line.end(), [](char character) {
            const auto byte = static_cast<unsigned char>(character);
            return byte < 0x20 || byte == 0x7f;
        })) << line;
    }
}

} // namespace
