#include "DamagedLines.h"
#include "FakeFiles.h"
#include "Snapshot.h"
#include "StoreListing.h"
#include "TestLog.h"
#include "Text.h"

#include <gmock/gmock.h>

#include <algorithm>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

std::string accountLine(const std::string& name) { return name + ":x:7:7::/h:/bin/sh"; }
std::string shadowLine(const std::string& name) { return name + ":!:19000:0:99999:7:::"; }
std::string groupLine(const std::string& name) { return name + ":x:7:m"; }

struct DamagedFile {
    const char* name;
    int type;
    std::string (*goodLine)(const std::string&);
    std::vector<DamagedLine> (*lines)();
};

void PrintTo(const DamagedFile& file, std::ostream* stream) { *stream << file.name; }

class DamagedLines : public testing::TestWithParam<DamagedFile> {
protected:
    DamagedLines() {
        clearLog();
        files.put("/r/etc/passwd", accountLine("first") + "\n" + accountLine("last") + "\n");
    }

    // The names that the file gives records of.
    std::vector<std::string> served(const std::string& content) {
        files.put(std::string("/r/etc/") + GetParam().name, content);
        const auto store = makeStore("accounts:/r", files);
        if (GetParam().type != 0) {
            return namesOf(store, GetParam().type);
        }
        std::vector<std::string> locked;
        for (const std::string& name : namesOf(store, UserAccount)) {
            if (accountNumber(store, name, AccountState) == 16U) {
                locked.push_back(name);
            }
        }
        return locked;
    }

    std::vector<std::string> goodNames(std::vector<std::string> names) const {
        names.erase(std::remove_if(
                        names.begin(), names.end(),
                        [](const std::string& name) { return name != "first" && name != "last"; }),
                    names.end());
        return names;
    }

    std::string good(const std::string& name) const { return GetParam().goodLine(name); }

    FakeFiles files;
};

// A name for the trace of a failing line.
std::string shown(const std::string& line) { return printable(line.substr(0, 60)); }

} // namespace

TEST_P(DamagedLines, Between_good_lines_cost_neither_of_them) {
    for (const DamagedLine& line : GetParam().lines()) {
        SCOPED_TRACE(shown(line.text));
        const auto names = served(good("first") + "\n" + line.text + "\n" + good("last") + "\n");
        EXPECT_THAT(goodNames(names), ElementsAre("first", "last"));
        if (GetParam().type != 0) {
            EXPECT_EQ(names.size(), line.served ? 3U : 2U);
        }
    }
}

TEST_P(DamagedLines, At_the_start_cost_no_good_line) {
    for (const DamagedLine& line : GetParam().lines()) {
        SCOPED_TRACE(shown(line.text));
        const auto names = served(line.text + "\n" + good("first") + "\n" + good("last"));
        EXPECT_THAT(goodNames(names), ElementsAre("first", "last"));
    }
}

TEST_P(DamagedLines, At_the_end_without_line_end_cost_no_good_line) {
    for (const DamagedLine& line : GetParam().lines()) {
        SCOPED_TRACE(shown(line.text));
        const auto names = served(good("first") + "\n" + good("last") + "\n" + line.text);
        EXPECT_THAT(goodNames(names), ElementsAre("first", "last"));
    }
}

TEST_P(DamagedLines, Are_reported_by_number_once_for_each_state_of_the_file) {
    for (const DamagedLine& line : GetParam().lines()) {
        SCOPED_TRACE(shown(line.text));
        clearLog();
        files.put(std::string("/r/etc/") + GetParam().name,
                  good("first") + "\n\n" + line.text + "\n" + good("last") + "\n");
        const auto store = makeStore("accounts:/r", files);
        for (int request = 0; request < 3; ++request) {
            namesOf(store, UserAccount);
            store->refresh();
        }
        EXPECT_THAT(loggedTexts(), ElementsAre(testing::AllOf(HasSubstr(GetParam().name),
                                                              HasSubstr("1 damaged line: 3 ("))));
    }
}

TEST_P(DamagedLines, Are_never_quoted_in_the_log) {
    for (const DamagedLine& line : GetParam().lines()) {
        served(line.text + "\nsecret-hash:secret-hash\n");
    }
    for (const std::string& text : loggedTexts()) {
        EXPECT_EQ(text.find("secret"), std::string::npos) << text;
    }
}

TEST_P(DamagedLines, All_together_leave_every_good_line) {
    std::string content;
    std::string passwd;
    std::vector<std::string> names;
    for (const DamagedLine& line : GetParam().lines()) {
        names.push_back("good" + std::to_string(names.size()));
        content += good(names.back()) + "\n" + line.text + "\n";
        passwd += accountLine(names.back()) + "\n";
    }
    files.put("/r/etc/passwd", passwd);
    auto found = served(content);
    found.erase(std::remove_if(found.begin(), found.end(),
                               [](const std::string& name) { return name.rfind("good", 0) != 0; }),
                found.end());
    EXPECT_EQ(found, names);
}

TEST_P(DamagedLines, A_name_used_twice_counts_where_it_stands_first) {
    const auto names = served(good("first") + "\n" + good("last") + "\n" + good("first") + "\n");
    EXPECT_THAT(names, ElementsAre("first", "last"));
    EXPECT_THAT(loggedTexts(), ElementsAre(HasSubstr("3 (name used before)")));
}

TEST_P(DamagedLines, Comments_and_empty_lines_are_no_damage) {
    const auto names = served("# a comment: x\n\n   \n\t\n" + good("first") + "\n  # " +
                              good("no") + "\n" + good("last") + "\n\n");
    EXPECT_THAT(names, ElementsAre("first", "last"));
    EXPECT_THAT(loggedTexts(), IsEmpty());
}

TEST_P(DamagedLines, A_missing_line_end_at_the_end_is_no_damage) {
    EXPECT_THAT(served(good("first") + "\n" + good("last")), ElementsAre("first", "last"));
    EXPECT_THAT(loggedTexts(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(
    Files, DamagedLines,
    testing::Values(DamagedFile{"passwd", UserAccount, accountLine, damagedAccountLines},
                    DamagedFile{"shadow", 0, shadowLine, damagedShadowLines},
                    DamagedFile{"group", UserGroup, groupLine, damagedGroupLines}),
    [](const auto& file) { return std::string(file.param.name); });

TEST(DamagedAccountLines, The_first_of_two_accounts_of_a_name_is_served) {
    FakeFiles files;
    files.put("/r/etc/passwd", "a:x:1:1::/one:\na:x:2:2::/two:\n");
    const auto store = makeStore("accounts:/r", files);
    EXPECT_EQ(accountText(store, "a", HomeDirectory), "/one");
}

TEST(DamagedAccountLines, An_account_that_log_ins_would_find_is_not_hidden_by_its_odd_form) {
    FakeFiles files;
    files.put("/r/etc/passwd",
              "  lead:x: 0:+0:::\nnul:x:0:0:::/bin/sh" + std::string(1, '\0') + "hidden\n");
    const auto store = makeStore("accounts:/r", files);
    EXPECT_EQ(accountText(store, "lead", UserID), "0");
    EXPECT_EQ(accountText(store, "nul", ScriptPath), "/bin/sh");
}

TEST(DamagedAccountLines, Ill_formed_bytes_are_replaced_and_the_node_kept) {
    FakeFiles files;
    files.put("/r/etc/passwd", "j\xF6rg:x:1:1:J\xF6rg,x:/home/j\xF6rg:/bin/\xFFsh\n");
    const auto store = makeStore("accounts:/r", files);
    const std::string mark = "\xEF\xBF\xBD";
    EXPECT_EQ(accountText(store, "j" + mark + "rg", FullName), "J" + mark + "rg");
    EXPECT_EQ(accountText(store, "j" + mark + "rg", HomeDirectory), "/home/j" + mark + "rg");
    EXPECT_EQ(accountText(store, "j" + mark + "rg", ScriptPath), "/bin/" + mark + "sh");
    EXPECT_EQ(cursorOn(store, UserAccount, "j" + mark + "rg").path(),
              "/UserAdministration/1/UserAccount/j%F6rg");
}

TEST(DamagedAccountLines, A_line_of_a_megabyte_is_served_whole) {
    FakeFiles files;
    const std::string home = "/" + std::string(1024UL * 1024, 'h');
    std::string members = "m0";
    for (int i = 1; i < 300'000; ++i) {
        members += ",m";
    }
    files.put("/r/etc/passwd", "a:x:1:1:::\nbig:x:1:1::" + home + ":/bin/sh\nz:x:1:1:::\n");
    files.put("/r/etc/group", "big:x:1:" + members + "\nafter:x:2:\n");
    const auto store = makeStore("accounts:/r", files);
    EXPECT_EQ(accountText(store, "big", HomeDirectory), home);
    EXPECT_THAT(namesOf(store, UserAccount), ElementsAre("a", "big", "z"));
    EXPECT_THAT(namesOf(store, UserGroup), ElementsAre("big", "after"));
    std::vector<std::string> read;
    cursorOn(store, UserGroup, "big").read(GroupMembers, read);
    EXPECT_EQ(read.size(), 300'000U);
}

TEST(DamagedAccountLines, A_line_too_long_for_any_record_costs_only_itself) {
    clearLog();
    FakeFiles files;
    files.put("/r/etc/passwd",
              "a:x:1:1:::\nbig:x:1:1:" + std::string(17UL * 1024 * 1024, 'g') + "::\nz:x:1:1:::\n");
    EXPECT_THAT(namesOf(makeStore("accounts:/r", files), UserAccount), ElementsAre("a", "z"));
    EXPECT_THAT(loggedTexts(), ElementsAre(HasSubstr("1 damaged line: 2 (")));
}

TEST(DamagedAccountLines, Days_that_no_number_can_hold_are_no_property) {
    FakeFiles files;
    files.put("/r/etc/shadow", "alice:h:-5:-1:99999:-7::-1:\n");
    const auto store = makeStore("accounts:/r", files);
    EXPECT_EQ(accountText(store, "alice", PasswordLastChanged), std::nullopt);
    EXPECT_EQ(accountNumber(store, "alice", PasswordDaysMustKeep), std::nullopt);
    EXPECT_EQ(accountNumber(store, "alice", PasswordDaysWarnBeforeExpire), std::nullopt);
    EXPECT_EQ(accountText(store, "alice", PasswordExpiration), std::nullopt);
}

TEST(DamageReport, Of_many_lines_is_one_short_line) {
    clearLog();
    FakeFiles files;
    std::string content;
    for (int i = 0; i < 1000; ++i) {
        content += "bad\n";
    }
    files.put("/r/etc/group", content);
    namesOf(makeStore("accounts:/r", files), UserGroup);
    ASSERT_THAT(loggedTexts(), ElementsAre(testing::AllOf(HasSubstr("1000 damaged lines: 1 (too"),
                                                          HasSubstr("and 990 more"))));
    EXPECT_LT(loggedTexts()[0].size(), 500U);
}

} // namespace qelo::nodes::tests
