#include "platform/ProviderUtilities.h"

#include "common/Utf8.h"

#include <string_view>

namespace Tesk {
namespace {

using qelo::platform::isControl;
using qelo::platform::kInvalidCodePoint;
using qelo::platform::nextCodePoint;

constexpr std::size_t kLongestValue = 255;

// Separates the arguments of a command.
constexpr char32_t kSeparator = U',';

bool contains(std::string_view text, char32_t wanted) {
    for (std::size_t offset = 0; offset < text.size();) {
        if (nextCodePoint(text, offset) == wanted) {
            return true;
        }
    }
    return false;
}

bool isRefused(char32_t character, std::string_view extra) {
    return character == kInvalidCodePoint || character == kSeparator || isControl(character) ||
           contains(extra, character);
}

} // namespace

bool ProviderUtilities::ValidateInput(const std::string& value, const std::string& extra) {
    if (value.size() > kLongestValue) {
        return false;
    }
    for (std::size_t offset = 0; offset < value.size();) {
        if (isRefused(nextCodePoint(value, offset), extra)) {
            return false;
        }
    }
    return true;
}

} // namespace Tesk
