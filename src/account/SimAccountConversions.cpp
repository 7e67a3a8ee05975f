// Conversions of account texts. Part of the source unit SimAccountObjFactory.

#include "SimAccountObjFactory.h"

#include <unicode/ucnv.h>
#include <unicode/ustring.h>

#include <algorithm>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountObjFactory("Corvane.SimAccountObjFactory");
const UnitTrace unit(loggerSimAccountObjFactory, "SimAccountObjFactory");

} // namespace

void SimAccountFactory::convertCodepage(char* target, unsigned int targetLength, char* source,
                                        unsigned int sourceLength) {
    CallTrace call(
        unit, parameters(" target=", static_cast<void*>(target), " targetLength=", targetLength,
                         " source=", static_cast<void*>(source), " sourceLength=", sourceLength));
    constexpr int32_t capacity = 509;           // UTF-16 units
    constexpr unsigned int longestSource = 254; // bytes, each at most one unit
    const auto length = static_cast<int32_t>(std::min(sourceLength, longestSource));
    UChar wide[capacity + 1] = {};
    UErrorCode error = U_ZERO_ERROR;
    UConverter* converter = ucnv_open("UTF8", &error);
    ucnv_toUChars(converter, wide, capacity, source, length, &error);
    ucnv_close(converter);
    u_austrncpy(target, wide, static_cast<int32_t>(targetLength));
    call.leave();
}

// NOLINTNEXTLINE(performance-unnecessary-value-param): texts are handed over by value
std::string SimAccountFactory::adjustString(std::string value) {
    CallTrace call(unit, parameters(" value=", value));
    constexpr std::size_t dateDigits = 14;
    std::string digits;
    for (const char c : value) {
        if (c >= '0' && c <= '9') {
            digits += c;
            if (digits.size() == dateDigits) {
                return call.leave(digits + ".000000+000");
            }
        }
    }
    return call.leave(std::string());
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
