#include <broker/RegistrationFile.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::broker {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

RegistrationFile parse(const std::string& text) { return parseRegistrations("x.reg", text); }

std::string errorOf(const std::string& text) {
    try {
        parse(text);
    } catch (const schema::SchemaError& error) {
        return error.what();
    }
    return {};
}

constexpr char kWhole[] = "provider: P\nlocation: lib\ntype: instance\nnamespace: root/a\n";

TEST(RegistrationFileTest, Sections_become_registrations) {
    const RegistrationFile file = parse("# first\n\n[ A_Class ]\r\n\t provider :  P\n"
                                        "location: lib\n   # more\n"
                                        "type: Instance METHOD association property indication\n"
                                        "namespace: root/a\troot/b\n[B]\n" +
                                        std::string(kWhole));
    ASSERT_EQ(file.registrations.size(), 2U);
    const ProviderRegistration& first = file.registrations[0];
    EXPECT_EQ(first.className, "A_Class");
    EXPECT_EQ(first.provider, "P");
    EXPECT_EQ(first.library, "lib");
    EXPECT_THAT(first.nameSpaces, ElementsAre("root/a", "root/b"));
    for (const ProviderType type : allProviderTypes) {
        EXPECT_TRUE(first.types.has(type)) << providerTypeName(type);
    }
    EXPECT_FALSE(file.registrations[1].types.has(ProviderType::Method));
    EXPECT_THAT(file.warnings, IsEmpty());
}

TEST(RegistrationFileTest, Other_keys_are_ignored_with_a_warning) {
    const RegistrationFile file =
        parse("[B]\n" + std::string(kWhole) + "unload: never\ngroup: x\ncolor: red\n");
    EXPECT_EQ(file.registrations.size(), 1U);
    EXPECT_THAT(file.warnings, ElementsAre("x.reg:6: ignored: unload", "x.reg:7: ignored: group",
                                           "x.reg:8: ignored: color"));
}

TEST(RegistrationFileTest, An_empty_file_registers_nothing) {
    EXPECT_THAT(parse("").registrations, IsEmpty());
    EXPECT_THAT(parse("\n  \n# only a comment").registrations, IsEmpty());
}

TEST(RegistrationFileTest, Errors_tell_file_and_line) {
    EXPECT_EQ(errorOf("provider: P"), "x.reg:1: \"[Class]\" is expected first");
    EXPECT_EQ(errorOf("[A]\nfoo"), "x.reg:2: \"[Class]\" or \"key: value\" is expected");
    EXPECT_EQ(errorOf("\n[A"), "x.reg:2: the name of a class in brackets is expected");
    EXPECT_EQ(errorOf("[]"), "x.reg:1: the name of a class in brackets is expected");
    EXPECT_EQ(errorOf("[A b]"), "x.reg:1: the name of a class in brackets is expected");
    EXPECT_EQ(errorOf("[A]\ntype: instance query"), "x.reg:2: no such type of provider: query");
    EXPECT_EQ(errorOf("[A]\nprovider: two words"),
              "x.reg:2: a single word is expected for provider");
    EXPECT_EQ(errorOf("[A]\nprovider:"), "x.reg:2: a single word is expected for provider");
    EXPECT_EQ(errorOf("[A]\nprovider: P\nprovider: P"), "x.reg:3: provider is given twice");
    EXPECT_EQ(errorOf("\n[A]\nprovider: P\n[B]\n" + std::string(kWhole)),
              "x.reg:2: class A has no location");
    EXPECT_EQ(errorOf("[A]\nprovider: P\nlocation: l\ntype: instance"),
              "x.reg:1: class A has no namespace");
    EXPECT_EQ(errorOf("[A]\nprovider: P\nlocation: l\ntype:\nnamespace: n"),
              "x.reg:1: class A has no type");
}

} // namespace
} // namespace qelo::broker
