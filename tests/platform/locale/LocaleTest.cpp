#include "platform/TeskLocale.h"

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <map>
#include <optional>
#include <string>

namespace {

using Tesk::Locale;

class LocaleTest : public testing::Test {
protected:
    LocaleTest() {
        for (const char* name : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
            const char* value = std::getenv(name);
            before[name] = value == nullptr ? std::nullopt : std::optional<std::string>(value);
            ::unsetenv(name);
        }
        (void)std::setlocale(LC_ALL, "C");
    }

    ~LocaleTest() override {
        for (const auto& [name, value] : before) {
            if (value) {
                ::setenv(name.c_str(), value->c_str(), 1);
            } else {
                ::unsetenv(name.c_str());
            }
        }
        (void)std::setlocale(LC_ALL, "C");
    }

    static void set(const char* name, const char* value) { ::setenv(name, value, 1); }

    std::map<std::string, std::optional<std::string>> before;
};

TEST_F(LocaleTest, Without_any_setting_the_language_is_English) {
    EXPECT_EQ(Locale::getLanguageId(), "en");
}

TEST_F(LocaleTest, In_the_C_locale_the_environment_decides) {
    set("LANG", "de_DE.UTF-8");
    EXPECT_EQ(Locale::getLanguageId(), "de");
}

TEST_F(LocaleTest, The_variables_count_in_the_order_of_the_C_library) {
    set("LANG", "de_DE.UTF-8");
    set("LC_MESSAGES", "fr_FR.UTF-8");
    EXPECT_EQ(Locale::getLanguageId(), "fr");
    set("LC_ALL", "ja_JP.UTF-8");
    EXPECT_EQ(Locale::getLanguageId(), "ja");
    set("LC_ALL", "");
    EXPECT_EQ(Locale::getLanguageId(), "fr");
    set("LC_ALL", "C.UTF-8");
    EXPECT_EQ(Locale::getLanguageId(), "en");
}

TEST_F(LocaleTest, A_locale_that_the_process_has_set_outweighs_the_environment) {
    if (std::setlocale(LC_MESSAGES, "C.UTF-8") == nullptr) {
        GTEST_SKIP() << "this system has no locale but C";
    }
    set("LANG", "de_DE.UTF-8");
    EXPECT_EQ(Locale::getLanguageId(), "en");
}

TEST_F(LocaleTest, A_hostile_environment_is_English) {
    set("LC_ALL", "../../../../etc/passwd");
    EXPECT_EQ(Locale::getLanguageId(), "en");
    set("LC_ALL", std::string(100000, 'x').c_str());
    EXPECT_EQ(Locale::getLanguageId(), "en");
}

TEST_F(LocaleTest, Libraries_of_different_numbers_and_languages_have_different_names) {
    EXPECT_NE(Locale::getResourceLibrary(2, "de"), Locale::getResourceLibrary(2, "en"));
    EXPECT_NE(Locale::getResourceLibrary(2, "de"), Locale::getResourceLibrary(3, "de"));
    EXPECT_EQ(Locale::getResourceLibrary(2, "de_AT"), Locale::getResourceLibrary(2, "de"));
}

} // namespace
