#include "Text.h"

#include <gtest/gtest.h>

namespace qelo::nodes::tests {

TEST(Text, Valid_text_stays_as_it_is) {
    const std::string text = "J\xC3\xB6rg \xE2\x82\xAC \xF0\x9F\x98\x80";
    EXPECT_TRUE(isValidUtf8(text));
    EXPECT_EQ(validUtf8(text), text);
}

TEST(Text, Every_kind_of_ill_formed_sequence_is_replaced) {
    const std::vector<std::string> damaged = {
        "\x80", "\xC3",     "\xC0\xAF",     "\xE0\x80\x80", "\xED\xA0\x80", "\xF4\x90\x80\x80",
        "\xFF", "\xE2\x82", "\xF0\x9F\x98", "\xFE\xFE",     "\xC3\x28"};
    for (const std::string& bytes : damaged) {
        EXPECT_FALSE(isValidUtf8(bytes));
        const std::string text = validUtf8("a" + bytes + "b");
        EXPECT_TRUE(isValidUtf8(text));
        EXPECT_NE(text.find("\xEF\xBF\xBD"), std::string::npos);
        EXPECT_EQ(text.front(), 'a');
        EXPECT_EQ(text.back(), 'b');
    }
}

TEST(Text, A_printable_text_holds_no_control_character) {
    EXPECT_EQ(printable("/AccountServiceRoot/1"), "/AccountServiceRoot/1");
    EXPECT_EQ(printable("a\nb\tc\x7F"), "a%0Ab%09c%7F");
    EXPECT_EQ(printable(std::string("a\0b", 3)), "a%00b");
    EXPECT_EQ(printable("\xC2\x85\xE2\x80\xA8"), "%C2%85%E2%80%A8");
    EXPECT_EQ(printable("\xFF"), "\xEF\xBF\xBD");
    EXPECT_EQ(printable("J\xC3\xB6rg"), "J\xC3\xB6rg");
}

TEST(Text, Every_byte_can_be_part_of_a_path_step) {
    EXPECT_EQ(pathStep("alice-1_x.y~Z"), "alice-1_x.y~Z");
    EXPECT_EQ(pathStep("host$"), "host%24");
    EXPECT_EQ(pathStep("a/b c%2F"), "a%2Fb%20c%252F");
    EXPECT_EQ(pathStep("\xFF\n"), "%FF%0A");
}

TEST(Text, A_path_lies_under_another_only_when_it_continues_it_after_a_slash) {
    EXPECT_TRUE(liesUnder("/a/1/b", "/a/1"));
    EXPECT_TRUE(liesUnder("/a", ""));
    EXPECT_FALSE(liesUnder("/a/1", "/a/1"));
    EXPECT_FALSE(liesUnder("/a/12/b", "/a/1"));
    EXPECT_FALSE(liesUnder("/a", "/a/1"));
    EXPECT_FALSE(liesUnder("/b/a/1/c", "/a/1"));
    EXPECT_FALSE(liesUnder("", ""));
}

} // namespace qelo::nodes::tests
