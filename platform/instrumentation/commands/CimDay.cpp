#include "CimDay.h"

#include <algorithm>
#include <array>

namespace qelo::store {

namespace {

constexpr std::size_t kLength = 25;
constexpr long kMinutesPerDay = 24L * 60;

bool isDigit(char c) { return c >= '0' && c <= '9'; }

bool hasDateTimeForm(std::string_view text) {
    if (text.size() != kLength || text[14] != '.' || (text[21] != '+' && text[21] != '-')) {
        return false;
    }
    const auto areDigits = [&](std::size_t from, std::size_t count) {
        const std::string_view part = text.substr(from, count);
        return std::all_of(part.begin(), part.end(), isDigit);
    };
    return areDigits(0, 14) && areDigits(22, 3) &&
           (areDigits(15, 6) || text.substr(15, 6) == "******");
}

long numberAt(std::string_view text, std::size_t from, std::size_t count) {
    long number = 0;
    for (const char digit : text.substr(from, count)) {
        number = number * 10 + (digit - '0');
    }
    return number;
}

bool isLeapYear(long year) { return (year % 4 == 0 && year % 100 != 0) || year % 400 == 0; }

long daysInMonth(long year, long month) {
    static constexpr std::array<long, 12> kDays{31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    return month == 2 && isLeapYear(year) ? 29 : kDays.at(static_cast<std::size_t>(month - 1));
}

long daysBeforeYear(long year) {
    const long past = year - 1;
    return past * 365 + past / 4 - past / 100 + past / 400;
}

long dayNumber(long year, long month, long day) {
    long days = daysBeforeYear(year) - daysBeforeYear(1970) + day - 1;
    for (long earlier = 1; earlier < month; ++earlier) {
        days += daysInMonth(year, earlier);
    }
    return days;
}

} // namespace

Attempt<long> dayOfDateTime(std::string_view text) {
    const Refusal refusal{"is not a date and time from 1970 on"};
    if (!hasDateTimeForm(text)) {
        return refusal;
    }
    const long year = numberAt(text, 0, 4);
    const long month = numberAt(text, 4, 2);
    const long day = numberAt(text, 6, 2);
    const long hour = numberAt(text, 8, 2);
    const long minute = numberAt(text, 10, 2);
    const bool inCalendar = year >= 1969 && month >= 1 && month <= 12 && day >= 1 &&
                            day <= daysInMonth(year, month) && hour < 24 && minute < 60 &&
                            numberAt(text, 12, 2) < 60;
    if (!inCalendar) {
        return refusal;
    }
    const long east = numberAt(text, 22, 3) * (text[21] == '+' ? 1 : -1);
    const long minutes = dayNumber(year, month, day) * kMinutesPerDay + hour * 60 + minute - east;
    return minutes < 0 ? Attempt<long>(refusal) : Attempt<long>(minutes / kMinutesPerDay);
}

} // namespace qelo::store
