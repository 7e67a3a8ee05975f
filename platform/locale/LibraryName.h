// Names of resource libraries and of languages.
//
// A library's name is "<package>_<language>", for example "management_de". All functions are
// pure and may be called from any thread.
#pragma once

#include <string>
#include <string_view>

namespace qelo::locale {

// The language every text exists in.
constexpr std::string_view kFallbackLanguage = "en";

// The library that holds the texts of the management providers.
constexpr unsigned long kManagementLibrary = 2;

// The language part of a locale name such as "de_CH.UTF-8@euro" or "pt-BR", in lower case.
// Anything that does not begin with a language code ("C", "POSIX", a path) gives English.
std::string languageOf(std::string_view localeName);

// The name of library `number` for `languageId`. A number that no library has gives a name
// that holds no texts.
std::wstring libraryName(unsigned long number, std::string_view languageId);

struct Library {
    std::string package;
    std::string language;
};

// The two parts of a library's name; both are empty where `name` is no such name.
Library parseLibraryName(std::wstring_view name);

} // namespace qelo::locale
