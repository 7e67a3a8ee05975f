#include "locale/LibraryName.h"

#include <gtest/gtest.h>

namespace {

using namespace qelo::locale;

TEST(LibraryName, The_language_is_the_first_part_of_a_locale_name) {
    EXPECT_EQ(languageOf("de"), "de");
    EXPECT_EQ(languageOf("de_CH.UTF-8@euro"), "de");
    EXPECT_EQ(languageOf("pt-BR"), "pt");
    EXPECT_EQ(languageOf("ja.UTF-8"), "ja");
    EXPECT_EQ(languageOf("ca@valencia"), "ca");
    EXPECT_EQ(languageOf("FR_fr"), "fr");
    EXPECT_EQ(languageOf("nds_DE"), "nds");
}

TEST(LibraryName, What_names_no_language_is_English) {
    for (const char* name : {"", "C", "POSIX", "C.UTF-8", "../../etc/passwd", "/x", "e", "d3",
                             "_de", "german", "d\xc3\xa9", "%s"}) {
        EXPECT_EQ(languageOf(name), "en") << name;
    }
    EXPECT_EQ(languageOf(std::string(1 << 20, 'x')), "en");
    EXPECT_EQ(languageOf(std::string("d\0e", 3)), "en");
}

TEST(LibraryName, A_name_tells_its_package_and_language_apart) {
    const Library library = parseLibraryName(libraryName(kManagementLibrary, "de_DE"));
    EXPECT_EQ(library.package, "management");
    EXPECT_EQ(library.language, "de");
    EXPECT_EQ(parseLibraryName(libraryName(77, "de")).package, "library77");
}

TEST(LibraryName, What_is_no_library_name_has_no_parts) {
    for (const wchar_t* name : {L"", L"management", L"management_", L"management_../x", L"_",
                                L"management_de_at", L"\u7c21_de", L"management_d1", L"/_de"}) {
        const Library library = parseLibraryName(name);
        EXPECT_TRUE(library.package.empty() && library.language.empty());
    }
    EXPECT_TRUE(parseLibraryName(std::wstring(1 << 20, L'a') + L"_de").package.empty());
}

} // namespace
