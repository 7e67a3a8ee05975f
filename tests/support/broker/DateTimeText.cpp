#include "support/broker/DateTimeText.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <ctime>

namespace qelo::test {

namespace {

constexpr std::size_t length = 25;
constexpr std::uint64_t microsecondsPerSecond = 1000000;

bool isDigit(char c) { return c >= '0' && c <= '9'; }
bool isAsterisk(char c) { return c == '*'; }

// A field of asterisks is the least value, an asterisk after digits a 0.
unsigned number(const std::string& text, std::size_t at, std::size_t count, unsigned least = 0) {
    if (isAsterisk(text[at])) {
        return least;
    }
    unsigned value = 0;
    for (std::size_t i = at; i < at + count; ++i) {
        value = value * 10 + (isAsterisk(text[i]) ? 0 : static_cast<unsigned>(text[i] - '0'));
    }
    return value;
}

bool isField(const std::string& text, std::size_t at, std::size_t count, unsigned least,
             unsigned most) {
    const auto begin = text.begin() + static_cast<std::ptrdiff_t>(at);
    const auto end = begin + static_cast<std::ptrdiff_t>(count);
    if (std::all_of(begin, end, isAsterisk)) {
        return true;
    }
    if (!std::all_of(begin, end, isDigit)) {
        return false;
    }
    const unsigned value = number(text, at, count);
    return value >= least && value <= most;
}

bool isFraction(const std::string& text) {
    const auto begin = text.begin() + 15;
    const auto end = begin + 6;
    return std::all_of(std::find_if_not(begin, end, isDigit), end, isAsterisk);
}

bool isTimeOfDay(const std::string& text) {
    return isField(text, 8, 2, 0, 23) && isField(text, 10, 2, 0, 59) &&
           isField(text, 12, 2, 0, 59) && text[14] == '.' && isFraction(text);
}

bool isDate(const std::string& text) {
    static constexpr std::array<unsigned, 12> days = {31, 29, 31, 30, 31, 30,
                                                      31, 31, 30, 31, 30, 31};
    if (!isField(text, 0, 4, 0, 9999) || !isField(text, 4, 2, 1, 12)) {
        return false;
    }
    return isField(text, 6, 2, 1, days[number(text, 4, 2, 1) - 1]);
}

// A signed number of days since 1970-01-01 in the Gregorian calendar.
std::int64_t daysSinceEpoch(int year, int month, int day) {
    // Years that begin in March have their leap day at the end.
    const int y = month <= 2 ? year - 1 : year;
    const int era = (y >= 0 ? y : y - 399) / 400;
    const int yearOfEra = y - era * 400;
    const int dayOfYear = (153 * (month + (month > 2 ? -3 : 9)) + 2) / 5 + day - 1;
    const int dayOfEra = yearOfEra * 365 + yearOfEra / 4 - yearOfEra / 100 + dayOfYear;
    return static_cast<std::int64_t>(era) * 146097 + dayOfEra - 719468;
}

} // namespace

bool isIntervalText(const std::string& text) { return text.size() == length && text[21] == ':'; }

bool isDateTimeText(const std::string& text) {
    if (text.size() != length || !isTimeOfDay(text)) {
        return false;
    }
    if (isIntervalText(text)) {
        return isField(text, 0, 8, 0, 99999999) && text.compare(22, 3, "000") == 0;
    }
    return (text[21] == '+' || text[21] == '-') && isDate(text) && isField(text, 22, 3, 0, 999);
}

std::uint64_t binaryOfDateTimeText(const std::string& text) {
    const std::int64_t timeOfDay =
        number(text, 8, 2) * 3600 + number(text, 10, 2) * 60 + number(text, 12, 2);
    const std::uint64_t fraction = number(text, 15, 6);
    std::int64_t days = 0;
    std::int64_t offset = 0;
    if (isIntervalText(text)) {
        days = number(text, 0, 8);
    } else {
        days = daysSinceEpoch(static_cast<int>(number(text, 0, 4)),
                              static_cast<int>(number(text, 4, 2, 1)),
                              static_cast<int>(number(text, 6, 2, 1)));
        offset = static_cast<std::int64_t>(number(text, 22, 3)) * (text[21] == '-' ? -60 : 60);
    }
    const std::int64_t seconds = days * 86400 + timeOfDay - offset;
    return static_cast<std::uint64_t>(seconds) * microsecondsPerSecond + fraction;
}

std::string dateTimeTextOf(std::uint64_t microseconds, bool interval) {
    const std::uint64_t seconds = microseconds / microsecondsPerSecond;
    const auto fraction = static_cast<unsigned>(microseconds % microsecondsPerSecond);
    std::array<char, 64> text{};
    if (interval) {
        const auto ofDay = static_cast<unsigned>(seconds % 86400);
        (void)std::snprintf(text.data(), text.size(), "%08llu%02u%02u%02u.%06u:000",
                            static_cast<unsigned long long>(seconds / 86400 % 100000000),
                            ofDay / 3600, ofDay / 60 % 60, ofDay % 60, fraction);
        return text.data();
    }
    const auto point = static_cast<std::time_t>(seconds);
    std::tm parts{};
    gmtime_r(&point, &parts);
    std::array<char, 32> date{};
    (void)std::strftime(date.data(), date.size(), "%Y%m%d%H%M%S", &parts);
    (void)std::snprintf(text.data(), text.size(), "%s.%06u+000", date.data(), fraction);
    return text.data();
}

} // namespace qelo::test
