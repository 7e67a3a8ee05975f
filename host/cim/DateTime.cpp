#include "DateTime.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cstddef>
#include <ctime>

namespace qelo::cim {
namespace {

constexpr std::size_t kLength = 25;
constexpr std::size_t kPoint = 14;     // of "."
constexpr std::size_t kFraction = 15;  // first digit of the microseconds
constexpr std::size_t kSeparator = 21; // "+", "-" or ":"
constexpr std::uint64_t kMicrosPerSecond = 1000000;
constexpr std::uint64_t kSecondsPerDay = 86400;
constexpr std::uint64_t kMaxIntervalDays = 99999999;
constexpr std::uint64_t kLastSecondOf9999 = 253402300799;

// Where a field stands, how many digits it has and which values it may take.
struct Field {
    std::size_t start;
    std::size_t length;
    unsigned int lowest;
    unsigned int highest;
};

// From the most significant to the least; asterisks may cover any tail of the list.
constexpr std::array<Field, 6> kTimeFields = {
    {{0, 4, 0, 9999}, {4, 2, 1, 12}, {6, 2, 1, 31}, {8, 2, 0, 23}, {10, 2, 0, 59}, {12, 2, 0, 59}}};
constexpr std::array<Field, 4> kIntervalFields = {
    {{0, 8, 0, kMaxIntervalDays}, {8, 2, 0, 23}, {10, 2, 0, 59}, {12, 2, 0, 59}}};

bool isDigit(char c) { return c >= '0' && c <= '9'; }
bool allDigits(std::string_view text) { return std::all_of(text.begin(), text.end(), isDigit); }
bool allAsterisks(std::string_view text) {
    return text.find_first_not_of('*') == std::string_view::npos;
}

unsigned int number(std::string_view digits) {
    unsigned int value = 0;
    for (const char c : digits) {
        value = value * 10 + static_cast<unsigned int>(c - '0');
    }
    return value;
}

// The value of a field, or its lowest value where asterisks stand.
unsigned int fieldValue(std::string_view text, const Field& field) {
    const std::string_view digits = text.substr(field.start, field.length);
    return allAsterisks(digits) ? field.lowest : number(digits);
}

template <std::size_t N>
bool fieldsAreValid(std::string_view text, const std::array<Field, N>& fields) {
    bool insignificant = false;
    for (const Field& field : fields) {
        const std::string_view digits = text.substr(field.start, field.length);
        insignificant = insignificant || allAsterisks(digits);
        if (insignificant ? !allAsterisks(digits) : !allDigits(digits)) {
            return false;
        }
        const unsigned int value = fieldValue(text, field);
        if (value < field.lowest || value > field.highest) {
            return false;
        }
    }
    const std::string_view fraction = text.substr(kFraction, kSeparator - kFraction);
    const std::size_t significant = std::min(fraction.find('*'), fraction.size());
    return allDigits(fraction.substr(0, significant)) &&
           allAsterisks(fraction.substr(significant)) && (!insignificant || significant == 0);
}

bool isLeapYear(unsigned int year) { return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0); }

bool dayExists(unsigned int year, unsigned int month, unsigned int day) {
    if (month == 2) {
        return day <= (isLeapYear(year) ? 29U : 28U);
    }
    const bool shortMonth = month == 4 || month == 6 || month == 9 || month == 11;
    return day <= (shortMonth ? 30U : 31U);
}

bool isPointInTime(std::string_view text) {
    return fieldsAreValid(text, kTimeFields) && allDigits(text.substr(kSeparator + 1)) &&
           dayExists(fieldValue(text, kTimeFields[0]), fieldValue(text, kTimeFields[1]),
                     fieldValue(text, kTimeFields[2]));
}

// The microseconds of the fraction; asterisks count as zeros.
std::uint64_t fractionOf(std::string_view text) {
    std::string digits(text.substr(kFraction, kSeparator - kFraction));
    std::replace(digits.begin(), digits.end(), '*', '0');
    return number(digits);
}

std::uint64_t pointInMicroseconds(std::string_view text) {
    std::tm parts{};
    parts.tm_year = static_cast<int>(fieldValue(text, kTimeFields[0])) - 1900;
    parts.tm_mon = static_cast<int>(fieldValue(text, kTimeFields[1])) - 1;
    parts.tm_mday = static_cast<int>(fieldValue(text, kTimeFields[2]));
    parts.tm_hour = static_cast<int>(fieldValue(text, kTimeFields[3]));
    parts.tm_min = static_cast<int>(fieldValue(text, kTimeFields[4]));
    parts.tm_sec = static_cast<int>(fieldValue(text, kTimeFields[5]));
    const auto offset = static_cast<std::int64_t>(number(text.substr(kSeparator + 1))) * 60;
    const std::int64_t local = timegm(&parts);
    const std::int64_t utc = text[kSeparator] == '-' ? local + offset : local - offset;
    return utc < 0 ? 0 : static_cast<std::uint64_t>(utc) * kMicrosPerSecond + fractionOf(text);
}

std::uint64_t intervalInMicroseconds(std::string_view text) {
    std::uint64_t seconds = fieldValue(text, kIntervalFields[0]);
    seconds = seconds * 24 + fieldValue(text, kIntervalFields[1]);
    seconds = seconds * 60 + fieldValue(text, kIntervalFields[2]);
    seconds = seconds * 60 + fieldValue(text, kIntervalFields[3]);
    return seconds * kMicrosPerSecond + fractionOf(text);
}

void appendPadded(std::string& text, std::uint64_t value, std::size_t width) {
    const std::string digits = std::to_string(value);
    text.append(width - std::min(width, digits.size()), '0');
    text += digits;
}

void appendClock(std::string& text, std::uint64_t secondOfDay, std::uint64_t fraction) {
    appendPadded(text, secondOfDay / 3600, 2);
    appendPadded(text, secondOfDay / 60 % 60, 2);
    appendPadded(text, secondOfDay % 60, 2);
    text += '.';
    appendPadded(text, fraction, 6);
}

std::string intervalText(std::uint64_t seconds, std::uint64_t fraction) {
    std::string text;
    appendPadded(text, seconds / kSecondsPerDay, 8);
    appendClock(text, seconds % kSecondsPerDay, fraction);
    return text + ":000";
}

std::string pointText(std::uint64_t seconds, std::uint64_t fraction) {
    const auto when = static_cast<std::time_t>(seconds);
    std::tm parts{};
    gmtime_r(&when, &parts);
    std::string text;
    appendPadded(text, static_cast<std::uint64_t>(parts.tm_year) + 1900, 4);
    appendPadded(text, static_cast<std::uint64_t>(parts.tm_mon) + 1, 2);
    appendPadded(text, static_cast<std::uint64_t>(parts.tm_mday), 2);
    appendClock(text, seconds % kSecondsPerDay, fraction);
    return text + "+000";
}

} // namespace

std::optional<DateTime> DateTime::parse(std::string_view text) {
    if (text.size() != kLength || text[kPoint] != '.') {
        return std::nullopt;
    }
    const char separator = text[kSeparator];
    const bool interval = separator == ':' && text.substr(kSeparator + 1) == "000" &&
                          fieldsAreValid(text, kIntervalFields);
    const bool point = (separator == '+' || separator == '-') && isPointInTime(text);
    if (!interval && !point) {
        return std::nullopt;
    }
    return DateTime(std::string(text));
}

DateTime DateTime::fromMicroseconds(std::uint64_t microseconds, bool interval) {
    const std::uint64_t last =
        interval ? (kMaxIntervalDays + 1) * kSecondsPerDay - 1 : kLastSecondOf9999;
    std::uint64_t seconds = microseconds / kMicrosPerSecond;
    std::uint64_t fraction = microseconds % kMicrosPerSecond;
    if (seconds > last) {
        seconds = last;
        fraction = kMicrosPerSecond - 1;
    }
    return DateTime(interval ? intervalText(seconds, fraction) : pointText(seconds, fraction));
}

DateTime DateTime::now() {
    const auto sinceEpoch = std::chrono::system_clock::now().time_since_epoch();
    const auto micros = std::chrono::duration_cast<std::chrono::microseconds>(sinceEpoch).count();
    return fromMicroseconds(static_cast<std::uint64_t>(std::max<std::int64_t>(micros, 0)), false);
}

std::uint64_t DateTime::microseconds() const {
    return isInterval() ? intervalInMicroseconds(text_) : pointInMicroseconds(text_);
}

} // namespace qelo::cim
