// Names of languages, resource libraries and texts, which come from the environment and from
// providers: there is a language and a text for each.
#include "FuzzInput.h"

#include <locale/LibraryName.h>
#include <platform/TeskLocale.h>

#include <algorithm>
#include <cstring>

namespace {

using namespace qelo::locale;
using qelo::fuzz::require;

bool isLanguage(std::string_view text) {
    return (text.size() == 2 || text.size() == 3) &&
           std::all_of(text.begin(), text.end(), [](char c) { return c >= 'a' && c <= 'z'; });
}

void checkLanguage(std::string_view name, unsigned long number) {
    const std::string language = languageOf(name);
    require(isLanguage(language) && languageOf(language) == language);
    const std::wstring library = libraryName(number, name);
    const Library parsed = parseLibraryName(library);
    require(parsed.language == language);
    require((parsed.package == "management") == (number == kManagementLibrary));
}

void checkLibrary(const std::wstring& name) {
    const Library library = parseLibraryName(name);
    require(library.package.empty() ? library.language.empty() || name.front() == L'_'
                                    : isLanguage(library.language));
    require(library.package.size() + library.language.size() <= name.size());
}

// A text that a library lacks is its own identifier.
void checkText(const std::wstring& library, const std::wstring& id) {
    const std::wstring text = Tesk::ResourceString(library, id);
    require(!text.empty() || id.empty());
    require(parseLibraryName(library).package == "management" || text == id);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string_view text = qelo::fuzz::viewOf(data, size);
    checkLanguage(text, size % 4);
    const std::string_view first = qelo::fuzz::takePart(text, '\n');
    const std::wstring library(first.begin(), first.end());
    const std::wstring id(text.begin(), text.end());
    checkLibrary(library);
    checkText(library, id);
    checkText(L"management_de", id);
    return 0;
}
