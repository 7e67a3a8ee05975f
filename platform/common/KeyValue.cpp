#include "common/KeyValue.h"

#include "common/CmpiRead.h"

#include <cstdint>

namespace qelo::platform {
namespace {

bool isNull(const CMPIData& data) {
    return data.type == CMPI_null || (data.state & CMPI_nullValue) != 0;
}

// An integer of any width: the sign and the bits tell all values of both signs apart.
struct Integer {
    bool negative;
    std::uint64_t bits;
};

bool operator==(const Integer& left, const Integer& right) {
    return left.negative == right.negative && left.bits == right.bits;
}

Integer signedInteger(std::int64_t value) { return {value < 0, static_cast<std::uint64_t>(value)}; }

std::optional<Integer> integerOf(const CMPIData& data) {
    switch (data.type) {
    case CMPI_uint8:
        return Integer{false, data.value.uint8};
    case CMPI_uint16:
        return Integer{false, data.value.uint16};
    case CMPI_uint32:
        return Integer{false, data.value.uint32};
    case CMPI_uint64:
        return Integer{false, data.value.uint64};
    case CMPI_sint8:
        return signedInteger(data.value.sint8);
    case CMPI_sint16:
        return signedInteger(data.value.sint16);
    case CMPI_sint32:
        return signedInteger(data.value.sint32);
    case CMPI_sint64:
        return signedInteger(data.value.sint64);
    default:
        return std::nullopt;
    }
}

std::optional<std::string_view> charactersOf(const CMPIData& data) {
    if (data.type == CMPI_string) {
        return textOf(data.value.string);
    }
    if (data.type == CMPI_chars && data.value.chars != nullptr) {
        return data.value.chars;
    }
    return std::nullopt;
}

std::optional<std::string_view> dateOf(const CMPIData& data) {
    return data.type == CMPI_dateTime ? textOf(data.value.dateTime) : std::nullopt;
}

std::optional<double> realOf(const CMPIData& data) {
    if (data.type == CMPI_real32) {
        return static_cast<double>(data.value.real32);
    }
    return data.type == CMPI_real64 ? std::optional<double>(data.value.real64) : std::nullopt;
}

std::optional<bool> flagOf(const CMPIData& data) {
    return data.type == CMPI_boolean ? std::optional<bool>(data.value.boolean != 0) : std::nullopt;
}

std::optional<CMPIChar16> char16Of(const CMPIData& data) {
    return data.type == CMPI_char16 ? std::optional<CMPIChar16>(data.value.char16) : std::nullopt;
}

// Two values of one kind: equal when `read` finds that kind in both, with equal contents.
template <typename Reader> bool equalBy(Reader read, const CMPIData& left, const CMPIData& right) {
    const auto leftValue = read(left);
    return leftValue && leftValue == read(right);
}

} // namespace

std::optional<bool> equalPlainValues(const CMPIData& left, const CMPIData& right) {
    if (isNull(left) || isNull(right)) {
        return isNull(left) && isNull(right);
    }
    if (left.type == CMPI_ref || right.type == CMPI_ref) {
        return left.type == right.type ? std::nullopt : std::optional<bool>(false);
    }
    return equalBy(charactersOf, left, right) || equalBy(integerOf, left, right) ||
           equalBy(flagOf, left, right) || equalBy(dateOf, left, right) ||
           equalBy(realOf, left, right) || equalBy(char16Of, left, right);
}

} // namespace qelo::platform
