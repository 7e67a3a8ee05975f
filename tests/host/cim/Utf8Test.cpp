#include <cim/Utf8.h>

#include <gtest/gtest.h>

namespace qelo::cim {
namespace {

TEST(Utf8, Every_character_survives_the_way_there_and_back) {
    for (char32_t code = 0; code <= 0x10FFFF; ++code) {
        if (code == 0xD800) {
            code = 0xE000;
        }
        const std::string text = utf8(code);
        const auto character = decodeUtf8(text, 0);
        ASSERT_TRUE(character) << static_cast<unsigned int>(code);
        ASSERT_EQ(character->code, code);
        ASSERT_EQ(character->length, text.size());
    }
}

TEST(Utf8, What_is_no_character_becomes_the_replacement_character) {
    EXPECT_EQ(utf8(0xD800), "\xEF\xBF\xBD");
    EXPECT_EQ(utf8(0xDFFF), "\xEF\xBF\xBD");
    EXPECT_EQ(utf8(0x110000), "\xEF\xBF\xBD");
}

TEST(Utf8, Malformed_bytes_are_found) {
    for (const char* text : {"\x80", "\xBF", "\xC3", "\xC3(", "\xE2\x82", "\xE2(\xA1",
                             "\xF0\x9F\x98", "\xF8\x88\x80\x80\x80", "\xFE", "\xFF", "a\xFF"}) {
        EXPECT_FALSE(isValidUtf8(text)) << text;
    }
}

TEST(Utf8, Overlong_forms_surrogates_and_numbers_beyond_Unicode_are_malformed) {
    for (const char* text :
         {"\xC0\xAF", "\xC1\xBF", "\xE0\x80\xAF", "\xF0\x80\x80\xAF", "\xED\xA0\x80",
          "\xED\xBF\xBF", "\xF4\x90\x80\x80", "\xF7\xBF\xBF\xBF"}) {
        EXPECT_FALSE(isValidUtf8(text)) << text;
    }
}

TEST(Utf8, Well_formed_text_is_valid) {
    EXPECT_TRUE(isValidUtf8(""));
    EXPECT_TRUE(isValidUtf8("ascii é 日本 😀 \xEF\xBF\xBF \xF4\x8F\xBF\xBF"));
}

} // namespace
} // namespace qelo::cim
