#include "ConfigText.h"
#include "FakeFiles.h"
#include "StoreListing.h"
#include "TestLog.h"

#include <gmock/gmock.h>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

const std::string security = "/r/etc/security/";

class PasswordPolicyOfSystem : public testing::Test {
protected:
    PasswordPolicyOfSystem() { clearLog(); }

    std::optional<unsigned int> number(int id) { return accountNumber(store, "alice", id); }
    std::optional<std::vector<unsigned int>> rules() {
        std::vector<unsigned int> list;
        const bool told = cursorOn(store, UserAccount, "alice").read(PasswordRules, list);
        return told ? std::optional(list) : std::nullopt;
    }
    std::optional<std::vector<unsigned int>> rulesFrom(const std::string& settings) {
        files.put(security + "pwquality.conf", settings);
        return rules();
    }
    void setStack(const std::string& lines) { files.put("/r/etc/pam.d/common-password", lines); }

    FakeFiles files;
    std::shared_ptr<NodeStore> store = makeStore("accounts:/r", files);
};

} // namespace

TEST_F(PasswordPolicyOfSystem, Is_not_told_where_nothing_is_set) {
    EXPECT_EQ(number(MaxLoginFailures), std::nullopt);
    EXPECT_EQ(number(PasswordHistoryDepth), std::nullopt);
    EXPECT_EQ(rules(), std::nullopt);
    EXPECT_THAT(loggedTexts(), IsEmpty());
}

TEST_F(PasswordPolicyOfSystem, Comments_set_nothing) {
    files.put(security + "faillock.conf", "# deny = 3\n#deny=4\naudit\n");
    files.put(security + "pwhistory.conf", "# remember = 10\n");
    setStack("# password requisite pam_pwhistory.so remember=5\n");
    EXPECT_EQ(rulesFrom("# minlen = 8\n# lcredit = -1\n"), std::nullopt);
    EXPECT_EQ(number(MaxLoginFailures), std::nullopt);
    EXPECT_EQ(number(PasswordHistoryDepth), std::nullopt);
}

TEST_F(PasswordPolicyOfSystem, Login_failures_come_from_the_lock_settings) {
    for (const char* text :
         {"deny = 5", "deny=5\n", "  deny\t=\t5 # five\naudit\n", "deny = 3\nsilent\ndeny = 5\n"}) {
        files.put(security + "faillock.conf", text);
        EXPECT_EQ(number(MaxLoginFailures), 5U) << text;
    }
}

TEST_F(PasswordPolicyOfSystem, A_number_that_is_none_is_no_setting_and_reported) {
    for (const char* text :
         {"deny = many", "deny =", "deny", "deny = 5x", "deny = 99999999999999999999"}) {
        clearLog();
        files.put(security + "faillock.conf", std::string("silent\n") + text + "\n");
        EXPECT_EQ(number(MaxLoginFailures), std::nullopt) << text;
        EXPECT_THAT(loggedTexts(),
                    ElementsAre(HasSubstr("faillock.conf: 1 damaged line: 2 (not a number)")));
    }
    for (const char* text : {"deny = -1", "deny = 4294967296"}) {
        files.put(security + "faillock.conf", text);
        EXPECT_EQ(number(MaxLoginFailures), std::nullopt) << text;
    }
}

TEST_F(PasswordPolicyOfSystem, History_comes_from_the_stack_before_its_settings_file) {
    setStack("password [success=1 default=ignore] pam_unix.so obscure use_authtok remember=3\n");
    EXPECT_EQ(number(PasswordHistoryDepth), 3U);
    files.put(security + "pwhistory.conf", "remember = 7\nenforce_for_root\n");
    EXPECT_EQ(number(PasswordHistoryDepth), 7U);
    setStack("password required pam_pwhistory.so use_authtok remember=12\n"
             "password [success=1 default=ignore] pam_unix.so remember=3\n");
    EXPECT_EQ(number(PasswordHistoryDepth), 12U);
}

TEST_F(PasswordPolicyOfSystem, Only_the_stack_for_password_changes_counts) {
    setStack("auth required pam_pwhistory.so remember=5\n"
             "session required pam_unix.so remember=5\n"
             "@include common-password\n"
             "password required pam_other.so remember=5\n");
    EXPECT_EQ(number(PasswordHistoryDepth), std::nullopt);
}

TEST_F(PasswordPolicyOfSystem, Each_form_of_a_stack_line_is_understood) {
    for (const char* line : {"password\trequired\t/lib/security/pam_pwhistory.so\tremember=4",
                             "-password optional pam_pwhistory.so remember=4 # four",
                             "password required \\\n pam_pwhistory.so \\\n remember=4\n",
                             "  password [a=b c=d] pam_pwhistory.so [remember=4]"}) {
        setStack(line);
        EXPECT_EQ(number(PasswordHistoryDepth), 4U) << line;
    }
}

TEST_F(PasswordPolicyOfSystem, Each_rule_comes_from_its_setting) {
    EXPECT_THAT(*rulesFrom("minlen = 12"), ElementsAre(1U));
    EXPECT_THAT(*rulesFrom("usercheck = 1"), ElementsAre(2U));
    EXPECT_THAT(*rulesFrom("maxrepeat = 3"), ElementsAre(3U));
    EXPECT_THAT(*rulesFrom("lcredit = -1"), ElementsAre(4U));
    EXPECT_THAT(*rulesFrom("ucredit = -2"), ElementsAre(5U));
    EXPECT_THAT(*rulesFrom("dcredit = -1"), ElementsAre(6U));
    EXPECT_THAT(*rulesFrom("ocredit = -1"), ElementsAre(7U));
    EXPECT_THAT(*rulesFrom("minclass = 4"), ElementsAre(4U, 5U, 6U, 7U));
}

TEST_F(PasswordPolicyOfSystem, Rules_come_in_ascending_order) {
    EXPECT_THAT(*rulesFrom("ocredit=-1\ndcredit=-1\nmaxrepeat=2\nminlen=8\n"),
                ElementsAre(1U, 3U, 6U, 7U));
}

TEST_F(PasswordPolicyOfSystem, Settings_that_require_nothing_give_no_rule) {
    EXPECT_EQ(rulesFrom("minlen=0\nusercheck=0\nmaxrepeat=0\nlcredit=1\nucredit=0\nminclass=3\n"),
              std::nullopt);
}

TEST_F(PasswordPolicyOfSystem, Settings_override_each_other_in_the_order_of_the_modules) {
    const std::string parts = security + "pwquality.conf.d";
    files.put(parts, "");
    files.put(parts + "/20-b.conf", "dcredit = -1\nminlen = 0\n");
    files.put(parts + "/10-a.conf", "dcredit = 0\nminlen = 8\n");
    files.put(parts + "/30-c.conf.bak", "ocredit = -1\n");
    files.put(parts + "/.hidden.conf", "ocredit = -1\n");
    EXPECT_THAT(*rules(), ElementsAre(6U));
    EXPECT_EQ(rulesFrom("dcredit = 0"), std::nullopt);
    setStack("password requisite pam_pwquality.so retry=3 dcredit=-1 minlen=10\n");
    EXPECT_THAT(*rules(), ElementsAre(1U, 6U));
}

TEST_F(PasswordPolicyOfSystem, Older_modules_give_rules_too) {
    setStack("password requisite pam_cracklib.so reject_username lcredit=-1\n"
             "password sufficient pam_unix.so minlen=6\n");
    EXPECT_THAT(*rules(), ElementsAre(1U, 2U, 4U));
}

TEST(ConfigText, Damaged_texts_are_read_without_harm) {
    for (const std::string& text :
         {std::string("\\"), std::string("password"), std::string("password ["),
          std::string("password [a"), std::string("password [a] ["), std::string("=\n==\n=x"),
          std::string("password required pam_unix.so ="), std::string(1'000'000, '['),
          std::string(100'000, '\\'), std::string("\0\0\0", 3), std::string("\xFF=\xFF")}) {
        EXPECT_LE(readPasswordModules(text).size(), 1U);
        EXPECT_LE(readSettings(text).size(), 3U);
    }
}

} // namespace qelo::nodes::tests
