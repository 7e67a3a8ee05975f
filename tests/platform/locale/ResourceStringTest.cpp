#include "platform/TeskLocale.h"

#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <type_traits>
#include <vector>

namespace {

using Tesk::Locale;
using Tesk::ResourceString;

static_assert(sizeof(ResourceString) == sizeof(void*), "holds exactly one pointer");
static_assert(!std::is_polymorphic_v<ResourceString>, "has no virtual functions");
static_assert(!std::is_copy_constructible_v<ResourceString>, "is not copyable");

const std::wstring caption = L"MSGID_SIMPLE_ID_MANAGEMENT_CAPTION";

std::wstring text(const std::wstring& library, const std::wstring& id = caption) {
    return ResourceString(library, id);
}

std::wstring captionIn(const std::string& language) {
    return text(Locale::getResourceLibrary(2, language));
}

TEST(ResourceString, The_caption_is_there_in_every_language) {
    EXPECT_EQ(captionIn("en"), L"Simple Identity Management");
    EXPECT_EQ(captionIn("de"), L"Einfache Identit\u00e4tsverwaltung");
    EXPECT_EQ(captionIn("fr"), L"Gestion simple des identit\u00e9s");
    EXPECT_EQ(captionIn("es"), L"Gesti\u00f3n simple de identidades");
    EXPECT_EQ(captionIn("ja"),
              L"\u7c21\u6613\u30a2\u30a4\u30c7\u30f3\u30c6\u30a3\u30c6\u30a3\u7ba1\u7406");
}

TEST(ResourceString, A_language_without_texts_gets_English_ones) {
    EXPECT_EQ(captionIn("xx"), L"Simple Identity Management");
    EXPECT_EQ(captionIn("zu_ZA"), L"Simple Identity Management");
}

TEST(ResourceString, A_locale_of_a_country_gets_the_texts_of_its_language) {
    EXPECT_EQ(captionIn("de_CH.UTF-8"), captionIn("de"));
}

TEST(ResourceString, A_text_that_does_not_exist_is_its_identifier) {
    EXPECT_EQ(text(Locale::getResourceLibrary(2, "de"), L"MSGID_NONE"), L"MSGID_NONE");
    EXPECT_EQ(text(Locale::getResourceLibrary(2, "de"), L""), L"");
}

TEST(ResourceString, A_library_that_does_not_exist_gives_the_identifier) {
    EXPECT_EQ(text(Locale::getResourceLibrary(0, "en")), caption);
    EXPECT_EQ(text(Locale::getResourceLibrary(3, "en")), caption);
    EXPECT_EQ(text(Locale::getResourceLibrary(~0UL, "en")), caption);
    EXPECT_EQ(text(L""), caption);
    EXPECT_EQ(text(L"icudt72l_en"), caption);
}

TEST(ResourceString, Hostile_languages_are_harmless) {
    EXPECT_EQ(captionIn("../../etc/passwd"), L"Simple Identity Management");
    EXPECT_EQ(captionIn(std::string(1 << 20, 'd')), L"Simple Identity Management");
    EXPECT_EQ(captionIn(std::string("de\0x", 4)), L"Simple Identity Management");
    EXPECT_EQ(captionIn("root"), L"Simple Identity Management");
}

TEST(ResourceString, Hostile_libraries_and_identifiers_are_harmless) {
    EXPECT_EQ(text(L"management_../../x"), caption);
    EXPECT_EQ(text(std::wstring(1 << 20, L'x')), caption);
    EXPECT_EQ(text(L"\u7c21\u6613_de"), caption);
    for (const std::wstring& id :
         {std::wstring(1 << 20, L'X'), std::wstring(L"a/b"), std::wstring(L"%n%s"),
          std::wstring(L"\0x", 2), std::wstring(1, static_cast<wchar_t>(0x110000))}) {
        EXPECT_EQ(text(Locale::getResourceLibrary(2, "de"), id), id);
    }
}

TEST(ResourceString, Ever_new_identifiers_do_not_spoil_later_lookups) {
    for (int number = 0; number < 5000; ++number) {
        const std::wstring id = L"MSGID_" + std::to_wstring(number);
        ASSERT_EQ(text(Locale::getResourceLibrary(2, "fr"), id), id);
    }
    EXPECT_EQ(captionIn("fr"), L"Gestion simple des identit\u00e9s");
}

TEST(ResourceString, Several_threads_get_the_right_texts) {
    std::vector<std::thread> threads;
    for (const char* language : {"en", "de", "fr", "es", "ja", "xx"}) {
        threads.emplace_back([language] {
            const std::wstring expected = captionIn(language);
            for (int round = 0; round < 500; ++round) {
                EXPECT_EQ(captionIn(language), expected);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

} // namespace
