#include "platform/ProviderUtilities.h"

#include <gtest/gtest.h>

#include <string>

namespace {

bool accepts(const std::string& value, const std::string& extra = "") {
    return Tesk::ProviderUtilities::ValidateInput(value, extra);
}

TEST(ValidateInput, Ordinary_texts_pass) {
    EXPECT_TRUE(accepts(""));
    EXPECT_TRUE(accepts("root"));
    EXPECT_TRUE(accepts("pass word!\"#$%&'()*+-./:;<=>?@[\\]^_`{|}~"));
    EXPECT_TRUE(accepts("J\u00f6rg \u7c21\u6613 \U0001F600"));
}

TEST(ValidateInput, Control_characters_of_all_kinds_are_refused) {
    for (int character = 0; character < 0x20; ++character) {
        EXPECT_FALSE(accepts(std::string("a") + static_cast<char>(character) + "b")) << character;
    }
    EXPECT_FALSE(accepts("a\x7f"));
    EXPECT_FALSE(accepts("\xc2\x80"));
    EXPECT_FALSE(accepts("\xc2\x9f"));
    EXPECT_TRUE(accepts("\xc2\xa0"));
}

TEST(ValidateInput, The_separator_of_arguments_is_refused) {
    EXPECT_FALSE(accepts(","));
    EXPECT_FALSE(accepts("a,b"));
    EXPECT_TRUE(accepts("\uff0c"));
}

TEST(ValidateInput, What_is_not_UTF_8_is_refused) {
    for (const char* bytes :
         {"\x80", "\xff", "\xc0\xac", "\xe0\x80\xac", "\xf0\x80\x80\xac", // overlong
          "\xed\xa0\x80", "\xed\xbf\xbf",                                 // surrogates
          "\xf4\x90\x80\x80", "\xf8\x88\x80\x80\x80",                     // too large
          "\xc3", "\xe7\xb0", "\xf0\x9f\x98", "\xe7\xb0x"}) {             // truncated
        EXPECT_FALSE(accepts(bytes));
        EXPECT_FALSE(accepts(std::string("ab") + bytes));
    }
}

TEST(ValidateInput, A_text_of_255_bytes_passes_and_a_longer_one_does_not) {
    EXPECT_TRUE(accepts(std::string(255, 'x')));
    EXPECT_FALSE(accepts(std::string(256, 'x')));
    EXPECT_FALSE(accepts(std::string(8000000, 'x')));
    std::string wide;
    for (int count = 0; count < 85; ++count) {
        wide += "\u7c21";
    }
    EXPECT_TRUE(accepts(wide));
    EXPECT_FALSE(accepts(wide + "x"));
}

TEST(ValidateInput, Characters_named_in_addition_are_refused) {
    EXPECT_FALSE(accepts("a:b", ":"));
    EXPECT_FALSE(accepts("a b", "; "));
    EXPECT_TRUE(accepts("ab", ":; "));
    EXPECT_FALSE(accepts("x\u7c21", "\u6613\u7c21"));
}

TEST(ValidateInput, A_character_named_in_addition_does_not_refuse_others_of_the_same_bytes) {
    EXPECT_TRUE(accepts("\u00e9", "\u00e8")); // C3 A9 and C3 A8
}

TEST(ValidateInput, An_ill_formed_addition_refuses_no_good_text) {
    EXPECT_TRUE(accepts("good", "\xff\xc3"));
    EXPECT_FALSE(accepts("a:b", "\xff:"));
}

} // namespace
