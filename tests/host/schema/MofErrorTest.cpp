#include "SchemaFixture.h"

namespace qelo::schema::testing {
namespace {

using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::StartsWith;

class MofErrorTest : public SchemaTest {};

TEST_F(MofErrorTest, An_error_tells_file_line_and_column) {
    EXPECT_EQ(errorOf("class T {\n  string 5;\n};"),
              "test.mof:2:10: the name of a property or method is expected, not \"5\"");
    EXPECT_EQ(errorOf("class T {\n  string A = \"x\" 5;\n};"),
              "test.mof:2:18: \";\" is expected, not \"5\"");
    EXPECT_EQ(errorOf("class T : Base {};"),
              "test.mof:1:7: the superclass Base of class T is not known");
    EXPECT_EQ(errorOf("class T {"), "test.mof:1:10: a type is expected, not the end of the text");
}

TEST_F(MofErrorTest, A_string_that_is_not_closed_is_told_on_its_line) {
    EXPECT_THAT(errorOf("class T { string A = \"x;\n};\n\n"), StartsWith("test.mof:1:"));
    EXPECT_THAT(errorOf("/* \n\n"), StartsWith("test.mof:1:1: the comment is not closed"));
}

TEST_F(MofErrorTest, Values_must_fit_their_type) {
    for (const char* text : {"uint8 A = 256;",
                             "uint8 A = -1;",
                             "sint8 A = 128;",
                             "sint64 A = 9223372036854775808;",
                             "uint64 A = 18446744073709551616;",
                             "boolean A = 1;",
                             "string A = TRUE;",
                             "uint32 A = 1.0;",
                             "uint32 A = \"1\";",
                             "datetime A = \"yesterday\";",
                             "char16 A = 'ab';",
                             "string A = {\"x\"};",
                             "string A[] = \"x\";",
                             "string A[1] = {\"x\", \"y\"};",
                             "uint32 A = 08;",
                             "uint32 A = 0x;",
                             "uint32 A = 12b;",
                             "uint32 A = 1a;",
                             "real32 A = 1.;",
                             "string A[0];",
                             "string A = ;",
                             "string A[] = {\"x\",};",
                             "strin A;"}) {
        EXPECT_THAT(errorOf(std::string("class T { ") + text + " };"), HasSubstr("test.mof:1:"))
            << text;
        EXPECT_EQ(repository.find(nameSpace, "T"), nullptr) << text;
    }
}

TEST_F(MofErrorTest, Qualifiers_must_be_where_and_what_they_are_declared) {
    const std::string start = standardQualifiers;
    EXPECT_THAT(errorOf(start + "[Key] class T {};"), HasSubstr("Key cannot stand here"));
    EXPECT_THAT(errorOf(start + "[Description(5)] class U {};"), HasSubstr("of type string"));
    EXPECT_THAT(errorOf("[Length(5)] class V {};"), HasSubstr("does not tell its type"));
    EXPECT_THAT(errorOf("[Length(NULL)] class V {};"), HasSubstr("does not tell its type"));
    EXPECT_THAT(errorOf("[List{}] class V {};"), HasSubstr("does not tell its type"));
    EXPECT_THAT(errorOf("[A, a] class V {};"), HasSubstr("given twice"));
    EXPECT_THAT(errorOf("[A : Sweet] class V {};"), HasSubstr("no such flavor: Sweet"));
    EXPECT_THAT(errorOf("Qualifier Q : boolean, Scope(house);"), HasSubstr("no such scope"));
    EXPECT_THAT(errorOf("Qualifier Key : string, Scope(any);"), HasSubstr("declared otherwise"));
}

TEST_F(MofErrorTest, Instances_must_fit_their_class) {
    const std::string start = std::string(standardQualifiers) +
                              "class T { [Key] string Name; uint16 Size; };"
                              "[Abstract] class Base { string A; };";
    EXPECT_THAT(errorOf(start), IsEmpty());
    EXPECT_THAT(errorOf("instance of U {};"), HasSubstr("no such class: U"));
    EXPECT_THAT(errorOf("instance of Base {};"), HasSubstr("abstract"));
    EXPECT_THAT(errorOf("instance of T { Size = 1; };"), HasSubstr("no value for the key Name"));
    EXPECT_THAT(errorOf("instance of T { Name = \"a\"; Weight = 1; };"),
                HasSubstr("no property Weight"));
    EXPECT_THAT(errorOf("instance of T { Name = \"a\"; NAME = \"a\"; };"), HasSubstr("twice"));
    EXPECT_THAT(errorOf("instance of T { Name = $b; };"), HasSubstr("not a value of type string"));
    EXPECT_THAT(errorOf("instance of T as $a { Name = \"a\"; };"
                        "instance of T as $A { Name = \"b\"; };"),
                HasSubstr("alias $A is there already"));
    EXPECT_THAT(errorOf("instance of T { Name = \"a\"; Size = 4; };"), HasSubstr("other values"));
}

TEST_F(MofErrorTest, Includes_are_bounded) {
    files["self.mof"] = "#pragma include (\"self.mof\")";
    EXPECT_THAT(errorOf("#pragma include (\"self.mof\")"), HasSubstr("too many includes"));
    // Doubled at every level: bounded by their number.
    files["a.mof"] = "";
    for (int i = 0; i < 14; ++i) {
        const std::string name = std::string(1, static_cast<char>('b' + i)) + ".mof";
        const std::string below = std::string(1, static_cast<char>('a' + i)) + ".mof";
        files[name] = "#pragma include (\"" + below + "\")\n#pragma include (\"" + below + "\")";
    }
    EXPECT_THAT(errorOf("#pragma include (\"o.mof\")"), HasSubstr("too many includes"));
}

TEST_F(MofErrorTest, An_include_that_cannot_be_had_is_told_where_it_stands) {
    EXPECT_EQ(errorOf("\n #pragma include (\"none.mof\")"),
              "test.mof:2:2: cannot include \"none.mof\": no such file");
    files["bad.mof"] = "class ;";
    EXPECT_THAT(errorOf("#pragma include (\"bad.mof\")"), StartsWith("bad.mof:1:7: "));
}

TEST_F(MofErrorTest, Text_that_is_not_utf8_is_refused) {
    EXPECT_THAT(errorOf("class T { string A = \"\xFF\"; };"), HasSubstr("not UTF-8"));
}

TEST_F(MofErrorTest, Inheritance_cannot_multiply_a_large_class_without_end) {
    std::string text = "[Big(\"" + std::string(1U << 20U, 'x') + "\")] class Base {};";
    for (int i = 0; i < 1000; ++i) {
        text += "class S" + std::to_string(i) + ":Base{};";
    }
    EXPECT_THAT(errorOf(text), HasSubstr("the schema is too large"));
}

TEST_F(MofErrorTest, A_long_line_of_superclasses_is_refused) {
    std::string text = "class C0 {};";
    for (int i = 1; i < 100; ++i) {
        text += "class C" + std::to_string(i) + ":C" + std::to_string(i - 1) + "{};";
    }
    EXPECT_THAT(errorOf(text), HasSubstr("too many superclasses"));
}

TEST_F(MofErrorTest, A_million_nested_braces_are_only_an_error) {
    EXPECT_THAT(errorOf("class T { string A[] = " + std::string(1000000, '{')),
                HasSubstr("a value is expected"));
    EXPECT_THAT(errorOf(std::string(1000000, '[')), HasSubstr("the name of a qualifier"));
}

} // namespace
} // namespace qelo::schema::testing
