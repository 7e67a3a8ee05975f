#include <cli/Arguments.h>
#include <cli/KnownClasses.h>

#include <gtest/gtest.h>

namespace qelo::cli {
namespace {

std::vector<std::string> spelled(std::vector<const char*> arguments) {
    arguments.insert(arguments.begin(), "qelosim");
    return spelledOut(static_cast<int>(arguments.size()), arguments.data());
}

using Texts = std::vector<std::string>;

TEST(Arguments, Two_letter_options_are_spelled_out) {
    EXPECT_EQ(spelled({"ain", "-ac", "A", "-rc", "B", "-rr", "C", "-r", "D"}),
              Texts({"ain", "--assoc-class", "A", "--result-class", "B", "--result-role", "C", "-r",
                     "D"}));
}

TEST(Arguments, Other_texts_stay_as_they_are) {
    EXPECT_EQ(spelled({"-a", "ac", "-acx", "-rc=", "", "-"}),
              Texts({"-a", "ac", "-acx", "-rc=", "", "-"}));
}

TEST(Arguments, Behind_two_dashes_nothing_is_an_option) {
    EXPECT_EQ(spelled({"-ac", "--", "-ac"}), Texts({"--assoc-class", "--", "-ac"}));
}

TEST(Arguments, No_arguments_are_no_texts) {
    EXPECT_TRUE(spelledOut(0, nullptr).empty());
    EXPECT_TRUE(spelled({}).empty());
}

TEST(Arguments, Names_are_letters_digits_and_underscores) {
    for (const char* name : {"A", "_x", "ZANTH_Account", "a1"}) {
        EXPECT_TRUE(isName(name)) << name;
    }
    for (const char* name : {"", "1a", "a b", "a-b", "é", "a\n"}) {
        EXPECT_FALSE(isName(name)) << name;
    }
}

TEST(Arguments, The_associations_among_the_known_classes_are_known) {
    EXPECT_TRUE(isKnownAssociation("ZANTH_AccountHostedService"));
    EXPECT_TRUE(isKnownAssociation("zanth_simelementcapabilities"));
    EXPECT_FALSE(isKnownAssociation("ZANTH_Account"));
    EXPECT_FALSE(isKnownAssociation("CIM_HostedService"));
}

} // namespace
} // namespace qelo::cli
