#include <cli/render/Display.h>

#include <gtest/gtest.h>

namespace qelo::cli {
namespace {

using namespace std::string_literals;

TEST(Display, Ordinary_text_stays_as_it_is) {
    for (const char* text : {"", "root", R"(C:\x1B)", "é", "日本", "e\u0301", "😀", "ﻉ"}) {
        EXPECT_EQ(displayText(text), text);
        EXPECT_TRUE(isDisplayable(std::string_view(text))) << text;
    }
}

TEST(Display, Control_characters_are_escaped) {
    EXPECT_EQ(displayText("a\n\t\r\x1b\x07\x7f\0b"s), R"(a\n\t\r\x001B\x0007\x007F\x0000b)");
    EXPECT_EQ(displayText("\u0085\u009b"), R"(\x0085\x009B)");
}

TEST(Display, Characters_that_turn_or_hide_text_are_escaped) {
    EXPECT_EQ(displayText("\u202e\u2066\u200b\u200d\ufeff\u00ad\u061c"),
              R"(\x202E\x2066\x200B\x200D\xFEFF\x00AD\x061C)");
    EXPECT_EQ(displayText("\u2028\u2029"), R"(\x2028\x2029)");
    EXPECT_EQ(displayText("\U000E0041"), R"(\U000E0041)");
}

TEST(Display, Characters_of_unknown_looks_are_escaped) {
    EXPECT_EQ(displayText("\ue000\uffff"), R"(\xE000\xFFFF)");
}

TEST(Display, Bytes_that_are_not_UTF8_are_escaped_one_by_one) {
    EXPECT_EQ(displayText("a\xff\xc3(\xe3\x81"), R"(a\xFF\xC3(\xE3\x81)");
    EXPECT_EQ(displayText("\xc0\xaf\xed\xa0\x80"), R"(\xC0\xAF\xED\xA0\x80)");
}

TEST(Display, What_is_made_displayable_is_displayable) {
    std::string everything;
    for (int first = 0; first < 256; ++first) {
        for (int second = 0; second < 256; second += 5) {
            everything += static_cast<char>(first);
            everything += static_cast<char>(second);
        }
    }
    const std::string text = displayText(everything);
    EXPECT_TRUE(isDisplayable(std::string_view(text)));
    EXPECT_EQ(displayText(text), text);
}

TEST(Display, Wide_characters_take_two_columns_and_combining_ones_none) {
    EXPECT_EQ(displayWidth("abc"), 3U);
    EXPECT_EQ(displayWidth("日本"), 4U);
    EXPECT_EQ(displayWidth("ｱ"), 1U);  // a half-width form
    EXPECT_EQ(displayWidth("Ａ"), 2U); // a full-width one
    EXPECT_EQ(displayWidth("한글"), 4U);
    EXPECT_EQ(displayWidth("e\u0301"), 1U);
    EXPECT_EQ(displayWidth("\u1112\u1161\u11ab"), 2U); // one syllable in three parts
    EXPECT_EQ(displayWidth("😀"), 2U);
    EXPECT_EQ(displayWidth(""), 0U);
}

TEST(Display, Text_that_fits_is_not_clipped) {
    EXPECT_EQ(clippedTo("abc", 3), "abc");
    EXPECT_EQ(clippedTo("日本", 4), "日本");
    EXPECT_EQ(clippedTo("", 0), "");
}

TEST(Display, Clipped_text_ends_in_an_ellipsis_and_never_exceeds_the_width) {
    EXPECT_EQ(clippedTo("abcd", 3), "ab…");
    EXPECT_EQ(clippedTo("abcd", 1), "…");
    EXPECT_EQ(clippedTo("abcd", 0), "");
    EXPECT_EQ(clippedTo("日本語", 5), "日本…");
    EXPECT_EQ(clippedTo("日本語", 4), "日…");
    EXPECT_EQ(clippedTo("e\u0301xyz", 2), "e\u0301…");
}

} // namespace
} // namespace qelo::cli
