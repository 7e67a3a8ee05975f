#include <cim/ObjectPath.h>

#include <gtest/gtest.h>

namespace qelo::cim {
namespace {

using namespace std::string_literals;

ObjectPath parsed(std::string_view text) {
    std::string error;
    const auto path = ObjectPath::parse(text, error);
    EXPECT_TRUE(path) << text << ": " << error;
    EXPECT_EQ(error, "");
    return path.value_or(ObjectPath());
}

std::string problem(std::string_view text) {
    std::string error;
    EXPECT_FALSE(ObjectPath::parse(text, error)) << text;
    return error;
}

TEST(ObjectPathParse, A_class_alone_is_a_class_path) {
    const ObjectPath path = parsed("ZANTH_Account");
    EXPECT_EQ(path.className(), "ZANTH_Account");
    EXPECT_EQ(path.nameSpace(), "");
    EXPECT_EQ(path.host(), "");
    EXPECT_TRUE(path.keys().empty());
}

TEST(ObjectPathParse, All_parts_are_read) {
    const ObjectPath path =
        parsed(R"(//server:5989/root/pg-1:ZANTH_X.Name="a",Size=5,Delta=-5,On=TRUE)");
    EXPECT_EQ(path.host(), "server:5989");
    EXPECT_EQ(path.nameSpace(), "root/pg-1");
    EXPECT_EQ(path.className(), "ZANTH_X");
    EXPECT_EQ(*path.key("Name"), Value::string("a"));
    EXPECT_EQ(*path.key("Size"), Value::unsignedInteger(Type::UInt64, 5));
    EXPECT_EQ(*path.key("Delta"), Value::signedInteger(Type::SInt64, -5));
    EXPECT_EQ(*path.key("On"), Value::boolean(true));
}

TEST(ObjectPathParse, A_host_may_be_a_numeric_address_and_need_no_namespace) {
    EXPECT_EQ(parsed("//[fe80::1%25eth0]:5989/ns:C").host(), "[fe80::1%25eth0]:5989");
    EXPECT_EQ(parsed("//h/C.K=1").className(), "C");
}

TEST(ObjectPathParse, Signs_inside_quotes_mean_nothing) {
    const ObjectPath path = parsed(R"(C.Name="a:b,c=\"d\".//e/",Other="\\")");
    EXPECT_EQ(path.nameSpace(), "");
    EXPECT_EQ(path.key("Name")->asString(), "a:b,c=\"d\".//e/");
    EXPECT_EQ(path.key("Other")->asString(), "\\");
}

TEST(ObjectPathParse, What_is_printed_is_read_again) {
    ObjectPath inner("root/cimv2", "ZANTH_Group");
    inner.setKey("Name", Value::string("a\"b\\c\x1b\n\xff"));
    ObjectPath path("root/cimv2", "ZANTH_Owner");
    path.setHost("h");
    path.setKey("Ref", Value::reference(inner));
    const ObjectPath again = parsed(path.toText(true));
    EXPECT_EQ(again.toText(true), path.toText(true));
    EXPECT_EQ(parsed(again.key("Ref")->asString()), inner);
}

TEST(ObjectPathParse, The_keys_keep_their_order) {
    const char* text = R"(C.Z="1",A="2",M="3")";
    EXPECT_EQ(parsed(text).toText(), text);
}

TEST(ObjectPathParse, Errors_say_what_is_wrong_and_where) {
    EXPECT_EQ(problem(""), "a class name is expected at character 1");
    EXPECT_EQ(problem("1C"), "a class name is expected at character 1");
    EXPECT_EQ(problem("root/cimv2:"), "a class name is expected at character 12");
    EXPECT_EQ(problem(":C"), "a namespace name is expected at character 1");
    EXPECT_EQ(problem("a//b:C"), "a namespace name is expected at character 3");
    EXPECT_EQ(problem("a b:C"), "unexpected character in the namespace at character 2");
    EXPECT_EQ(problem("C."), "a key name is expected at character 3");
    EXPECT_EQ(problem("C K=1"), "unexpected character behind the class name at character 2");
    EXPECT_EQ(problem("C.K"), "\"=\" is expected behind the key name at character 4");
    EXPECT_EQ(problem("C.K=\"a\"x"), "unexpected text behind a key value at character 8");
    EXPECT_EQ(problem("C.K=\"a\","), "a key name is expected at character 9");
    EXPECT_EQ(problem("C.K=\"a"), "the closing quote is missing at character 7");
    EXPECT_EQ(problem("C.K="), "an integer is expected at character 5");
    EXPECT_EQ(problem("C.K=abc"),
              "a text must stand in double quotes: unexpected value at character 5");
    EXPECT_EQ(problem("C.K=NULL"),
              "a text must stand in double quotes: unexpected value at character 5");
    EXPECT_EQ(problem("C.K=1,k=2"), "a key is given twice at character 7");
    EXPECT_EQ(problem("//"),
              "\"//\" must be followed by a host name and \"/\": unexpected text at character 3");
    EXPECT_EQ(problem("//h"),
              "\"//\" must be followed by a host name and \"/\": unexpected text at character 4");
}

TEST(ObjectPathParse, Numbers_that_64_bits_cannot_hold_are_refused) {
    EXPECT_EQ(parsed("C.K=18446744073709551615").key("K")->asUnsigned(), UINT64_MAX);
    EXPECT_EQ(parsed("C.K=-9223372036854775808").key("K")->asSigned(), INT64_MIN);
    EXPECT_EQ(problem("C.K=18446744073709551616"),
              "the number is out of the range of uint64 at character 5");
    EXPECT_EQ(problem("C.K=-9223372036854775809"),
              "the number is out of the range of sint64 at character 5");
}

TEST(ObjectPathParse, Control_characters_and_zero_bytes_outside_quotes_are_refused) {
    for (const std::string& text : {"C\0"s, "C.K\0=1"s, "C.K=1\0"s, "\x1b[1mC"s, "C.K=\"a\0\""s,
                                    "C\n"s, "C.K=1\n"s, " C"s, "//h\x1b/C"s}) {
        problem(text);
    }
}

TEST(ObjectPathParse, The_number_of_keys_is_limited) {
    std::string text = "C.K0=0";
    for (int i = 1; i < 64; ++i) {
        text += ",K" + std::to_string(i) + "=0";
    }
    EXPECT_EQ(parsed(text).keys().size(), 64U);
    EXPECT_NE(problem(text + ",X=1").find("too many keys"), std::string::npos);
}

TEST(ObjectPathParse, Every_cut_of_a_path_is_refused_or_read_without_harm) {
    const std::string text = R"(//h/root/cimv2:C.Name="a\"b\x0041",Size=-5,On=true)";
    for (std::size_t length = 0; length <= text.size(); ++length) {
        std::string error;
        const auto path = ObjectPath::parse(std::string_view(text).substr(0, length), error);
        EXPECT_EQ(path.has_value(), error.empty()) << length;
    }
}

TEST(ObjectPathParse, Minus_zero_is_the_same_key_as_zero) {
    std::string error;
    const auto path = ObjectPath::parse("C.A=-0", error);
    ASSERT_TRUE(path) << error;
    EXPECT_EQ(*path->key("A"), Value::unsignedInteger(Type::UInt64, 0));
    EXPECT_EQ(ObjectPath::parse(path->toText(), error), path);
}

} // namespace
} // namespace qelo::cim
