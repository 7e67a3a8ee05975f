#include <cim/QuotedText.h>

#include <gtest/gtest.h>

namespace qelo::cim {
namespace {

using namespace std::string_literals;

struct Read {
    std::optional<std::string> text;
    std::size_t position = 0;
    std::string error;
};

Read read(std::string_view text) {
    Read result;
    result.text = readQuoted(text, result.position, result.error);
    return result;
}

TEST(QuotedText, Quotes_and_backslashes_are_escaped) {
    EXPECT_EQ(quotedText(R"(a"b\c)"), R"("a\"b\\c")");
    EXPECT_EQ(quotedText(""), R"("")");
}

TEST(QuotedText, Control_characters_never_appear_as_they_are) {
    EXPECT_EQ(quotedText("\b\t\n\f\r\x1b\x7f\x01"s + "0"), R"("\b\t\n\f\r\x001B\x007F\x00010")");
}

TEST(QuotedText, Other_bytes_stay_as_they_are) {
    EXPECT_EQ(quotedText("日本 \xff"), "\"日本 \xff\"");
}

TEST(QuotedText, Everything_but_a_zero_byte_survives_the_way_there_and_back) {
    std::string all;
    for (int byte = 1; byte < 256; ++byte) {
        all += static_cast<char>(byte);
        all += "0aF\\\"";
    }
    EXPECT_EQ(read(quotedText(all)).text, all);
}

TEST(QuotedText, Reading_stops_behind_the_closing_quote) {
    const Read result = read(R"("ab",x="c")");
    EXPECT_EQ(result.text, "ab");
    EXPECT_EQ(result.position, 4U);
}

TEST(QuotedText, Every_escape_of_MOF_is_understood) {
    EXPECT_EQ(read(R"("\b\t\n\f\r\"\'\\")").text, "\b\t\n\f\r\"'\\");
    EXPECT_EQ(read(R"("\x41\X0042 \x7")").text, "AB \a");
    EXPECT_EQ(read(R"("\x00e9\x65e5")").text, "é日");
}

TEST(QuotedText, A_hexadecimal_escape_takes_at_most_four_digits) {
    EXPECT_EQ(read(R"("\x00411")").text, "A1");
}

TEST(QuotedText, A_missing_closing_quote_is_an_error) {
    for (const char* text : {R"(")", R"("abc)", R"("abc\")"}) {
        const Read result = read(text);
        EXPECT_FALSE(result.text) << text;
        EXPECT_EQ(result.error, "the closing quote is missing");
    }
}

TEST(QuotedText, Unknown_escapes_are_errors) {
    for (const char* text : {R"("\a")", R"("\0")", R"("\u0041")", "\"\\", "\"\\\x01\""}) {
        EXPECT_FALSE(read(text).text) << text;
    }
}

TEST(QuotedText, Escapes_that_name_no_character_are_errors) {
    for (const char* text :
         {R"("\x")", R"("\xg")", R"("\x0")", R"("\x0000")", R"("\xD800")", R"("\xdfff")"}) {
        const Read result = read(text);
        EXPECT_FALSE(result.text) << text;
        EXPECT_EQ(result.error, "\\x must be followed by the hexadecimal number of a character");
    }
}

TEST(QuotedText, A_zero_byte_is_an_error) { EXPECT_FALSE(read("\"a\0b\""s).text); }

} // namespace
} // namespace qelo::cim
