// Localised texts of the platform (libqelotesklocale.so.1).
#pragma once

#include "PlatformApi.h"

#include <string>

namespace Tesk {

class QELO_PLATFORM_API Locale {
public:
    // The language of this process, for example "en" or "de". Never empty.
    static std::string getLanguageId();

    // The name of resource library `number` for a language, to be given to ResourceString.
    static std::wstring getResourceLibrary(unsigned long number, std::string languageId);
};

// One text of a resource library. Falls back to English, and to the identifier itself
// where the library has no such text.
class QELO_PLATFORM_API ResourceString {
public:
    ResourceString(const std::wstring& library, const std::wstring& id);
    ~ResourceString();
    ResourceString(const ResourceString&) = delete;
    ResourceString& operator=(const ResourceString&) = delete;

    operator std::wstring() const;

private:
    struct Text;
    Text* text_;
};

} // namespace Tesk
