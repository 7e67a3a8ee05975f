// Taking the text of a command apart.
#include "CommandText.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {

namespace {

using store::ArgumentType;
using store::parseCommandText;

bool isRefused(const std::string& text) { return !parseCommandText(text); }

} // namespace

TEST(CommandText, A_method_stands_alone) {
    const auto command = parseCommandText("DeleteUser");
    ASSERT_TRUE(command);
    EXPECT_EQ("DeleteUser", command->method);
    EXPECT_TRUE(command->arguments.empty());
}

TEST(CommandText, Arguments_keep_their_order_types_and_values) {
    const auto command = parseCommandText("M,S:CMPI_string:v,N:CMPI_uint32:-1,"
                                          "D:CMPI_dateTime:20300101000000.000000+000");
    ASSERT_TRUE(command);
    ASSERT_EQ(3u, command->arguments.size());
    EXPECT_EQ("S", command->arguments[0].name);
    EXPECT_EQ(ArgumentType::Text, command->arguments[0].type);
    EXPECT_EQ("v", command->arguments[0].value);
    EXPECT_EQ(ArgumentType::Number, command->arguments[1].type);
    EXPECT_EQ("-1", command->arguments[1].value);
    EXPECT_EQ(ArgumentType::DateTime, command->arguments[2].type);
    EXPECT_EQ("20300101000000.000000+000", command->arguments[2].value);
}

TEST(CommandText, A_value_may_hold_colons_or_nothing) {
    const auto command = parseCommandText("M,A:CMPI_string:x:y::,B:CMPI_string:");
    ASSERT_TRUE(command);
    EXPECT_EQ("x:y::", command->arguments[0].value);
    EXPECT_EQ("", command->arguments[1].value);
}

TEST(CommandText, Values_are_views_of_the_text_and_no_copies) {
    const std::string text = "M,A:CMPI_string:secret";
    const auto command = parseCommandText(text);
    ASSERT_TRUE(command);
    EXPECT_EQ(text.data() + 16, command->arguments[0].value.data());
}

TEST(CommandText, What_may_have_been_cut_is_refused) {
    const std::string start = "M,A:CMPI_string:";
    const std::string longest = start + std::string(1022 - start.size(), 'x');
    EXPECT_FALSE(isRefused(longest));
    EXPECT_TRUE(isRefused(longest + "x"));
    EXPECT_TRUE(isRefused(longest + "xx"));
    EXPECT_TRUE(isRefused(longest + std::string(1 << 20, 'x')));
}

TEST(CommandText, Every_deviation_from_the_form_is_refused) {
    const std::vector<std::string> wrong{"",
                                         ",",
                                         " M",
                                         "M ",
                                         "M,",
                                         "M,,A:CMPI_string:x",
                                         "M,A:CMPI_string:x,",
                                         "M,A",
                                         "M,A:",
                                         "M,A:CMPI_string",
                                         "M,A:CMPI_boolean:1",
                                         "M,A:cmpi_string:x",
                                         "M,A:CMPI_string :x",
                                         "M,A::x",
                                         "M,:CMPI_string:x",
                                         "M, A:CMPI_string:x",
                                         "M,A-B:CMPI_string:x",
                                         "M,1A:CMPI_string:x",
                                         "1M",
                                         "M-N",
                                         "M\n",
                                         "M,A:CMPI_string:x\n",
                                         "M,A:CMPI_string:x\ty",
                                         "M,A:CMPI_string:x\x7f",
                                         std::string("M,A:CMPI_string:x\0y", 19),
                                         std::string("M\0", 2),
                                         "M:CMPI_string:x"};
    for (const std::string& text : wrong) {
        EXPECT_TRUE(isRefused(text)) << text;
    }
}

TEST(CommandText, A_refusal_never_quotes_the_text) {
    for (const char* text :
         {"secret secret", "M,secret", "M,A:secret:x", "M,A:CMPI_string:secret\n"}) {
        const auto command = parseCommandText(text);
        ASSERT_FALSE(command);
        EXPECT_THAT(command.reason(), testing::Not(testing::HasSubstr("secret")));
    }
}

} // namespace qelo::test
