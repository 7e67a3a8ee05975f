// Conversions of account texts. Part of the source unit SimAccountObjFactory.

#include "SimAccountObjFactory.h"

#include <unicode/ucnv.h>
#include <unicode/ustring.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <string_view>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountObjFactory("Corvane.SimAccountObjFactory");
const UnitTrace unit(loggerSimAccountObjFactory, "SimAccountObjFactory");

} // namespace

void SimAccountFactory::CloseConverter::operator()(UConverter* converter) const {
    ucnv_close(converter);
}

UConverter* SimAccountFactory::converter() {
    if (converter_ == nullptr) {
        UErrorCode error = U_ZERO_ERROR;
        converter_.reset(ucnv_open("UTF8", &error));
    }
    return converter_.get();
}

void SimAccountFactory::convertCodepage(char* target, unsigned int targetLength, char* source,
                                        unsigned int sourceLength) {
    CallTrace call(
        unit, parameters(" target=", static_cast<void*>(target), " targetLength=", targetLength,
                         " source=", static_cast<void*>(source), " sourceLength=", sourceLength));
    constexpr int32_t capacity = 509;           // UTF-16 units
    constexpr unsigned int longestSource = 254; // bytes, each at most one unit
    // The result ends at the first zero; what follows it need not be converted.
    const auto length =
        static_cast<int32_t>(::strnlen(source, std::min(sourceLength, longestSource)));
    UChar wide[capacity + 1];
    std::fill_n(wide, length + 1, UChar(0)); // no byte becomes more than one unit
    if (UConverter* fromUtf8 = converter(); fromUtf8 != nullptr) {
        UErrorCode error = U_ZERO_ERROR;
        ucnv_toUChars(fromUtf8, wide, capacity, source, length, &error);
    }
    u_austrncpy(target, wide, static_cast<int32_t>(targetLength));
    call.leave();
}

// NOLINTNEXTLINE(performance-unnecessary-value-param): texts are handed over by value
std::string SimAccountFactory::adjustString(std::string value) {
    CallTrace call(unit, parameters(" value=", value));
    constexpr std::size_t dateDigits = 14;
    constexpr std::string_view rest = ".000000+000";
    std::array<char, dateDigits + rest.size()> text{};
    std::size_t digits = 0;
    for (const char c : value) {
        if (c >= '0' && c <= '9') {
            text[digits++] = c;
            if (digits == dateDigits) {
                rest.copy(text.data() + dateDigits, rest.size());
                return call.leave(std::string(text.data(), text.size()));
            }
        }
    }
    return call.leave(std::string());
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
