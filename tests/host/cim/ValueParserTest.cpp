#include <cim/ValueParser.h>

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace qelo::cim {
namespace {

std::optional<Value> parse(Type type, std::string_view text) {
    std::string error;
    auto value = parseValue(type, text, error);
    EXPECT_EQ(error.empty(), value.has_value()) << text;
    return value;
}

std::string problem(Type type, std::string_view text) {
    std::string error;
    EXPECT_FALSE(parseValue(type, text, error)) << text;
    return error;
}

TEST(ValueParser, Type_names_are_found_ignoring_case) {
    EXPECT_EQ(typeOfName("uint32"), Type::UInt32);
    EXPECT_EQ(typeOfName("DateTime"), Type::DateTime);
    EXPECT_EQ(typeOfName("SINT8"), Type::SInt8);
    EXPECT_EQ(typeOfName("uint12"), std::nullopt);
    EXPECT_EQ(typeOfName(""), std::nullopt);
    EXPECT_EQ(typeOfName("reference"), std::nullopt);
    EXPECT_EQ(typeOfName("instance"), std::nullopt);
}

TEST(ValueParser, Integers_are_decimal_or_hexadecimal) {
    EXPECT_EQ(parse(Type::UInt32, "5")->asUnsigned(), 5U);
    EXPECT_EQ(parse(Type::UInt32, "+5")->asUnsigned(), 5U);
    EXPECT_EQ(parse(Type::UInt32, "-0")->asUnsigned(), 0U);
    EXPECT_EQ(parse(Type::UInt32, "0xFf")->asUnsigned(), 255U);
    EXPECT_EQ(parse(Type::UInt32, "017")->asUnsigned(), 17U);
    EXPECT_EQ(parse(Type::SInt32, "-0x10")->asSigned(), -16);
    EXPECT_EQ(parse(Type::SInt8, "-5")->type(), Type::SInt8);
}

TEST(ValueParser, The_extremes_of_every_integer_type_are_taken_and_nothing_beyond) {
    const struct {
        Type type;
        const char* lowest;
        const char* highest;
        const char* below;
        const char* above;
    } ranges[] = {
        {Type::UInt8, "0", "255", "-1", "256"},
        {Type::UInt16, "0", "65535", "-1", "65536"},
        {Type::UInt32, "0", "4294967295", "-1", "4294967296"},
        {Type::UInt64, "0", "18446744073709551615", "-1", "18446744073709551616"},
        {Type::SInt8, "-128", "127", "-129", "128"},
        {Type::SInt16, "-32768", "32767", "-32769", "32768"},
        {Type::SInt32, "-2147483648", "2147483647", "-2147483649", "2147483648"},
        {Type::SInt64, "-9223372036854775808", "9223372036854775807", "-9223372036854775809",
         "9223372036854775808"},
    };
    for (const auto& range : ranges) {
        EXPECT_EQ(parse(range.type, range.lowest)->toText(), range.lowest);
        EXPECT_EQ(parse(range.type, range.highest)->toText(), range.highest);
        const std::string expected =
            std::string("the number is out of the range of ") + typeName(range.type);
        EXPECT_EQ(problem(range.type, range.below), expected);
        EXPECT_EQ(problem(range.type, range.above), expected);
    }
}

TEST(ValueParser, What_is_no_integer_is_refused) {
    for (const char* text : {"", "-", "+", "0x", "0x-1", "--1", "+-1", "1 ", " 1", "1.0", "1e3",
                             "five", "0b1", "1,2", "١"}) {
        EXPECT_EQ(problem(Type::UInt32, text), "an integer is expected") << text;
        EXPECT_EQ(problem(Type::SInt32, text), "an integer is expected") << text;
    }
    EXPECT_EQ(problem(Type::UInt32, std::string_view("1\0", 2)), "an integer is expected");
}

TEST(ValueParser, A_very_long_number_is_out_of_range) {
    EXPECT_EQ(problem(Type::UInt64, std::string(100000, '9')),
              "the number is out of the range of uint64");
}

TEST(ValueParser, Booleans_ignore_case) {
    EXPECT_TRUE(parse(Type::Boolean, "true")->asBoolean());
    EXPECT_FALSE(parse(Type::Boolean, "FALSE")->asBoolean());
    for (const char* text : {"", "1", "yes", "true ", "t"}) {
        EXPECT_EQ(problem(Type::Boolean, text), "true or false is expected");
    }
}

TEST(ValueParser, Reals_are_decimal) {
    EXPECT_EQ(parse(Type::Real64, "0.5")->asReal(), 0.5);
    EXPECT_EQ(parse(Type::Real64, "+1e3")->asReal(), 1000.0);
    EXPECT_EQ(parse(Type::Real64, "-2.5E-1")->asReal(), -0.25);
    EXPECT_EQ(parse(Type::Real32, "0.1")->asReal(), static_cast<double>(0.1F));
    EXPECT_TRUE(std::isinf(parse(Type::Real32, "-INF")->asReal()));
    EXPECT_TRUE(std::isnan(parse(Type::Real64, "NaN")->asReal()));
}

TEST(ValueParser, What_is_no_real_is_refused) {
    for (const char* text : {"", "+", "-", ".", "e5", "1e", "0x1p3", "inf", "nan", "infinity",
                             "1,5", "+-1", "1.5 ", "nan(1)"}) {
        EXPECT_EQ(problem(Type::Real64, text), "a number is expected") << text;
    }
    EXPECT_EQ(problem(Type::Real64, "1e999"), "the number is out of the range of real64");
    EXPECT_EQ(problem(Type::Real32, "1e39"), "the number is out of the range of real32");
}

TEST(ValueParser, The_largest_real32_is_read_as_it_is_printed) {
    constexpr double largest = std::numeric_limits<float>::max();
    const std::string printed = Value::real(Type::Real32, largest).toText();
    EXPECT_EQ(printed, "3.4028235e+38"); // a little more than the number itself
    EXPECT_EQ(parse(Type::Real32, printed)->asReal(), largest);
    EXPECT_EQ(parse(Type::Real32, "-" + printed)->asReal(), -largest);
    EXPECT_EQ(problem(Type::Real32, "3.4028236e38"), "the number is out of the range of real32");
}

TEST(ValueParser, A_char16_is_exactly_one_character) {
    EXPECT_EQ(parse(Type::Char16, "A")->asUnsigned(), 65U);
    EXPECT_EQ(parse(Type::Char16, "日")->asUnsigned(), 0x65E5U);
    for (const char* text : {"", "AB", "😀", "\xff"}) {
        EXPECT_EQ(problem(Type::Char16, text), "exactly one character up to U+FFFF is expected");
    }
}

TEST(ValueParser, A_string_is_taken_as_it_is) {
    EXPECT_EQ(parse(Type::String, " a\n\"b ")->asString(), " a\n\"b ");
    EXPECT_EQ(parse(Type::String, "")->asString(), "");
}

TEST(ValueParser, A_datetime_needs_its_25_characters) {
    EXPECT_EQ(parse(Type::DateTime, "20140307123005.000000+000")->toText(),
              "20140307123005.000000+000");
    EXPECT_NE(problem(Type::DateTime, "2014-03-07").find("a datetime is expected"),
              std::string::npos);
}

TEST(ValueParser, References_and_instances_have_no_text_form) {
    EXPECT_EQ(problem(Type::Reference, "A.B=1"),
              "a value of type reference cannot be given as one text");
    EXPECT_EQ(problem(Type::Instance, "x"), "a value of type instance cannot be given as one text");
}

} // namespace
} // namespace qelo::cim
