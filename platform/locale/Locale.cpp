#include "platform/TeskLocale.h"

#include "locale/LibraryName.h"

#include <clocale>
#include <cstdlib>
#include <string_view>

namespace Tesk {
namespace {

bool isPortableLocale(std::string_view name) { return name == "C" || name == "POSIX"; }

// The environment's choice of message language, by the order the C library goes by.
std::string_view localeOfEnvironment() {
    for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
        const char* value = std::getenv(variable);
        if (value != nullptr && *value != '\0') {
            return value;
        }
    }
    return {};
}

} // namespace

// A process that never called setlocale runs in the C locale, which says nothing about its
// users: then the environment does.
std::string Locale::getLanguageId() {
    const char* active = std::setlocale(LC_MESSAGES, nullptr);
    const std::string_view name = active == nullptr ? std::string_view() : active;
    return qelo::locale::languageOf(name.empty() || isPortableLocale(name) ? localeOfEnvironment()
                                                                           : name);
}

// The copy is the interface's. NOLINTNEXTLINE(performance-unnecessary-value-param)
std::wstring Locale::getResourceLibrary(unsigned long number, std::string languageId) {
    return qelo::locale::libraryName(number, languageId);
}

} // namespace Tesk
