#include "locale/ResourceTexts.h"

#include "locale/LibraryName.h"

#include <unicode/udata.h>
#include <unicode/ures.h>
#include <unicode/ustring.h>

#include <algorithm>
#include <cstdint>
#include <map>
#include <mutex>
#include <new>
#include <optional>
#include <shared_mutex>
#include <utility>

extern "C" const struct ManagementPackage management_dat;

namespace qelo::locale {
namespace {

using SharedText = std::shared_ptr<const std::wstring>;

constexpr const char* kManagementData = "management";

// Bounds what callers with ever new names can make this library keep.
constexpr std::size_t kMostCachedTexts = 512;
constexpr std::size_t kLongestId = 128;

struct CloseBundle {
    void operator()(UResourceBundle* bundle) const { ures_close(bundle); }
};
using Bundle = std::unique_ptr<UResourceBundle, CloseBundle>;

// Resource keys are ASCII identifiers; nothing else can be one.
std::optional<std::string> keyOf(const std::wstring& id) {
    const auto isKeyCharacter = [](wchar_t character) {
        return (character >= L'A' && character <= L'Z') ||
               (character >= L'a' && character <= L'z') ||
               (character >= L'0' && character <= L'9') || character == L'_';
    };
    if (id.empty() || id.size() > kLongestId ||
        !std::all_of(id.begin(), id.end(), isKeyCharacter)) {
        return std::nullopt;
    }
    std::string key;
    std::transform(id.begin(), id.end(), std::back_inserter(key),
                   [](wchar_t character) { return static_cast<char>(character); });
    return key;
}

std::optional<std::wstring> widened(const UChar* text, std::int32_t length) {
    // A wide character holds any character, so the text can only become shorter.
    std::wstring wide(static_cast<std::size_t>(length), L'\0');
    std::int32_t written = 0;
    UErrorCode error = U_ZERO_ERROR;
    u_strToWCS(wide.data(), length, &written, text, length, &error);
    if (U_FAILURE(error)) {
        return std::nullopt;
    }
    wide.resize(static_cast<std::size_t>(written));
    return wide;
}

// Out of memory must not be taken, and remembered, for a text that does not exist.
void throwIfOutOfMemory(UErrorCode error) {
    if (error == U_MEMORY_ALLOCATION_ERROR) {
        throw std::bad_alloc();
    }
}

// Opened without ICU's own fallback, which would take the process's default locale first.
std::optional<std::wstring> textOfBundle(const char* language, const std::string& key) {
    UErrorCode error = U_ZERO_ERROR;
    const Bundle bundle(ures_openDirect(kManagementData, language, &error));
    std::int32_t length = 0;
    const UChar* text = ures_getStringByKey(bundle.get(), key.c_str(), &length, &error);
    throwIfOutOfMemory(error);
    return U_FAILURE(error) ? std::nullopt : widened(text, length);
}

bool registerPackages() {
    UErrorCode error = U_ZERO_ERROR;
    udata_setAppData(kManagementData, &management_dat, &error);
    throwIfOutOfMemory(error);
    return U_SUCCESS(error);
}

std::wstring lookUp(const std::wstring& libraryName, const std::wstring& id) {
    static const bool registered = registerPackages();
    const Library library = parseLibraryName(libraryName);
    const auto key = keyOf(id);
    if (!registered || !key || library.package != kManagementData) {
        return id;
    }
    auto text = textOfBundle(library.language.c_str(), *key);
    if (!text) {
        text = textOfBundle("root", *key);
    }
    return text.value_or(id);
}

class Cache {
public:
    SharedText find(const std::wstring& library, const std::wstring& id) const {
        const std::shared_lock lock(mutex_);
        const auto found = texts_.find(NameView(library, id));
        return found == texts_.end() ? nullptr : found->second;
    }

    void store(const std::wstring& library, const std::wstring& id, const SharedText& text) {
        if (library.size() > kLongestId || id.size() > kLongestId) {
            return;
        }
        const std::unique_lock lock(mutex_);
        if (texts_.size() < kMostCachedTexts) {
            texts_.emplace(Name(library, id), text);
        }
    }

private:
    using Name = std::pair<std::wstring, std::wstring>;
    using NameView = std::pair<std::wstring_view, std::wstring_view>;

    struct Less {
        using is_transparent = void;
        template <typename Left, typename Right>
        bool operator()(const Left& left, const Right& right) const {
            return NameView(left) < NameView(right);
        }
    };

    mutable std::shared_mutex mutex_;
    std::map<Name, SharedText, Less> texts_;
};

// Never destroyed: exit handlers may still ask for texts.
Cache& cache() {
    static Cache* const texts = new Cache;
    return *texts;
}

} // namespace

SharedText resourceText(const std::wstring& library, const std::wstring& id) {
    if (SharedText known = cache().find(library, id)) {
        return known;
    }
    auto text = std::make_shared<const std::wstring>(lookUp(library, id));
    cache().store(library, id, text);
    return text;
}

} // namespace qelo::locale
