#include "locale/LibraryName.h"

#include <algorithm>

namespace qelo::locale {
namespace {

constexpr std::string_view kManagementPackage = "management";

// Longer than any name made here; a longer one is not looked at.
constexpr std::size_t kLongestName = 64;

bool isLetter(char character) {
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z');
}

char lowered(char character) {
    return character >= 'A' && character <= 'Z' ? static_cast<char>(character - 'A' + 'a')
                                                : character;
}

// Language codes have two or three letters.
bool isLanguageCode(std::string_view text) {
    return (text.size() == 2 || text.size() == 3) &&
           std::all_of(text.begin(), text.end(), isLetter);
}

bool isNameCharacter(wchar_t character) {
    return (character >= L'a' && character <= L'z') || (character >= L'0' && character <= L'9') ||
           character == L'_';
}

} // namespace

std::string languageOf(std::string_view localeName) {
    const std::string_view code = localeName.substr(0, localeName.find_first_of("_-.@"));
    if (!isLanguageCode(code)) {
        return std::string(kFallbackLanguage);
    }
    std::string language(code);
    std::transform(language.begin(), language.end(), language.begin(), lowered);
    return language;
}

std::wstring libraryName(unsigned long number, std::string_view languageId) {
    const std::string package = number == kManagementLibrary ? std::string(kManagementPackage)
                                                             : "library" + std::to_string(number);
    const std::string name = package + "_" + languageOf(languageId);
    return std::wstring(name.begin(), name.end());
}

Library parseLibraryName(std::wstring_view name) {
    const std::size_t separator = name.find(L'_');
    if (name.size() > kLongestName || separator == std::wstring_view::npos ||
        !std::all_of(name.begin(), name.end(), isNameCharacter)) {
        return {};
    }
    std::string narrow;
    std::transform(name.begin(), name.end(), std::back_inserter(narrow),
                   [](wchar_t character) { return static_cast<char>(character); });
    if (!isLanguageCode(std::string_view(narrow).substr(separator + 1))) {
        return {};
    }
    return {narrow.substr(0, separator), narrow.substr(separator + 1)};
}

} // namespace qelo::locale
