// The two conversions of account texts: times to CIM dates, and UTF-8 to the local code page.
#include "AccountFixture.h"

#include <account/SimAccountObjFactory.h>

#include <unicode/ucnv.h>

#include <climits>
#include <cstring>

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using Tesk::SimpleIdentityManagementProvider::SimAccountFactory;

// ---- adjustString ----

struct TimeCase {
    const char* given;
    const char* date;
};

void PrintTo(const TimeCase& time, std::ostream* stream) {
    *stream << testing::PrintToString(time.given);
}

class TimeText : public testing::TestWithParam<TimeCase> {};

TEST_P(TimeText, Becomes_the_first_14_digits_in_UTC_or_nothing) {
    SimAccountFactory factory;
    EXPECT_EQ(factory.adjustString(GetParam().given), GetParam().date);
}

INSTANTIATE_TEST_SUITE_P(
    Texts, TimeText,
    testing::Values(TimeCase{"2014-03-07 12:30:05", "20140307123005.000000+000"},
                    TimeCase{"2014/03/07 12:30:05 GMT+1", "20140307123005.000000+000"},
                    TimeCase{"20140307123005", "20140307123005.000000+000"},
                    TimeCase{"20140307123005.999999+060", "20140307123005.000000+000"},
                    TimeCase{"99999999999999", "99999999999999.000000+000"},
                    TimeCase{"on 2014-03-07 at 12h30m05s", "20140307123005.000000+000"},
                    TimeCase{"20140307", ""}, TimeCase{"2014-03-07 12:30:0", ""}, TimeCase{"", ""},
                    TimeCase{"never", ""},
                    TimeCase{"\xD9\xA0\xD9\xA1\xD9\xA2 no ASCII digits", ""}));

TEST(TimeTextOfAnySize, Is_read_to_the_14th_digit) {
    SimAccountFactory factory;
    EXPECT_EQ(factory.adjustString(std::string(100000, '1')), "11111111111111.000000+000");
    EXPECT_EQ(factory.adjustString(std::string(100000, 'x')), "");
    EXPECT_EQ(factory.adjustString(std::string(5000, ' ') + "20140307123005"),
              "20140307123005.000000+000");
}

// ---- convertCodepage ----

// Gives the process another default code page for one test. A build of ICU may know no other
// than UTF-8; then nothing changes, and a test that needs the change must not run.
class DefaultCodepage {
public:
    explicit DefaultCodepage(const char* name) : before_(ucnv_getDefaultName()) {
        ucnv_setDefaultName(name);
    }
    ~DefaultCodepage() { ucnv_setDefaultName(before_.c_str()); }
    bool isUtf8() const { return std::string(ucnv_getDefaultName()) == "UTF-8"; }
    DefaultCodepage(const DefaultCodepage&) = delete;
    DefaultCodepage& operator=(const DefaultCodepage&) = delete;

private:
    std::string before_;
};

constexpr unsigned int codepageLimit = 254;

std::string convert(const std::string& text) {
    char source[codepageLimit + 1] = {};
    text.copy(source, codepageLimit);
    char target[codepageLimit + 1] = {};
    SimAccountFactory().convertCodepage(target, codepageLimit, source, codepageLimit);
    return target;
}

TEST(Codepage, ASCII_stays_as_it_is) { EXPECT_EQ(convert("/home/alice"), "/home/alice"); }

TEST(Codepage, An_empty_text_stays_empty) { EXPECT_EQ(convert(""), ""); }

TEST(Codepage, UTF_8_stays_where_the_process_uses_UTF_8) {
    const DefaultCodepage codepage("UTF-8");
    EXPECT_EQ(convert("/home/\xC3\xBC\xE2\x82\xAC"), "/home/\xC3\xBC\xE2\x82\xAC");
}

TEST(Codepage, UTF_8_becomes_Latin_1_where_the_process_uses_that) {
    const DefaultCodepage codepage("ISO-8859-1");
    if (codepage.isUtf8()) {
        GTEST_SKIP() << "this ICU uses UTF-8 whatever the process uses";
    }
    EXPECT_EQ(convert("/home/\xC3\xBC"), "/home/\xFC");
}

TEST(Codepage, The_target_length_is_never_exceeded) {
    const DefaultCodepage codepage("UTF-8");
    char source[] = "abcdefghij";
    char target[8];
    std::memset(target, '#', sizeof target);
    SimAccountFactory().convertCodepage(target, 4, source, 10);
    EXPECT_EQ(std::string(target, sizeof target), "abcd####");
}

TEST(Codepage, Bad_UTF_8_ends_nothing) {
    const DefaultCodepage codepage("UTF-8");
    const std::string result = convert("a\xFF\xC3(\xE2\x82");
    EXPECT_LE(result.size(), codepageLimit);
    EXPECT_EQ(result[0], 'a');
}

TEST(Codepage, A_text_that_would_grow_is_cut_at_the_targets_length) {
    const DefaultCodepage codepage("UTF-8");
    // Each bad byte becomes a replacement character of three bytes.
    EXPECT_LE(convert(std::string(codepageLimit, '\xFF')).size(), codepageLimit);
}

class AccountCodepage : public AccountFixture {
protected:
    std::string servedHome(const std::string& home, const char* property = "HomeDirectory") {
        platform_.reset();
        StoreNode node = accountNode("alice");
        node.properties[HomeDirectory] = home;
        node.properties[ScriptPath] = home;
        serve({node});
        enumInstances();
        return onlyInstance().propertyText(property);
    }
};

TEST_F(AccountCodepage, Directories_of_254_bytes_are_whole_and_longer_ones_cut_there) {
    const std::string longest = "/" + std::string(253, 'd');
    for (const char* property : {"HomeDirectory", "ScriptPath"}) {
        EXPECT_EQ(servedHome(longest, property), longest);
        EXPECT_EQ(servedHome(longest + "e", property), longest);
        EXPECT_EQ(servedHome(longest + std::string(10000, 'e'), property), longest);
    }
}

TEST_F(AccountCodepage, A_text_of_two_byte_characters_is_cut_after_127_of_them) {
    const DefaultCodepage codepage("UTF-8");
    std::string text;
    for (int i = 0; i < 200; ++i) {
        text += "\xC3\xBC";
    }
    EXPECT_EQ(servedHome(text), text.substr(0, codepageLimit));
}

TEST_F(AccountCodepage, Both_directories_reach_the_client_in_the_local_code_page) {
    const DefaultCodepage codepage("ISO-8859-1");
    if (codepage.isUtf8()) {
        GTEST_SKIP() << "this ICU uses UTF-8 whatever the process uses";
    }
    EXPECT_EQ(servedHome("/home/\xC3\xBC"), "/home/\xFC");
    EXPECT_EQ(servedHome("/bin/\xC3\xBC", "ScriptPath"), "/bin/\xFC");
}

TEST_F(AccountCodepage, A_character_cut_in_half_does_no_harm) {
    const DefaultCodepage codepage("UTF-8");
    const std::string text = std::string(253, 'a') + "\xC3\xBC";
    const std::string served = servedHome(text);
    EXPECT_EQ(served.substr(0, 253), text.substr(0, 253));
    EXPECT_LE(served.size(), codepageLimit);
}

TEST_F(AccountCodepage, Other_texts_are_not_converted) {
    const DefaultCodepage codepage("ISO-8859-1");
    StoreNode node = accountNode("al\xC3\xBC");
    node.properties[FullName] = std::string(1000, 'f') + "\xC3\xBC";
    serve({node});
    enumInstances();
    EXPECT_EQ(onlyInstance().propertyText("Name"), "al\xC3\xBC");
    EXPECT_EQ(onlyInstance().propertyText("Description"), std::string(1000, 'f') + "\xC3\xBC");
}

} // namespace
} // namespace qelo::test
