// CIM datetime (DMTF DSP0004): a point in time "yyyymmddhhmmss.mmmmmmsutc" or an interval
// "ddddddddhhmmss.mmmmmm:000", always 25 characters. An immutable value; every function may
// be called from any thread.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace qelo::cim {

class DateTime {
public:
    // Reads either 25-character form; nothing for any other text, for impossible dates
    // (month 13, 31 April, hour 24) and for offsets that are not three digits.
    // Trailing asterisks for insignificant digits are accepted as the standard has them:
    // whole fields from the right, single digits only in the microseconds.
    static std::optional<DateTime> parse(std::string_view text);

    // `microseconds` since 1970-01-01T00:00:00Z, or the length of an interval. What the 25
    // characters cannot hold becomes the largest value that they can: the last microsecond
    // of the year 9999, or of an interval of 99999999 days.
    static DateTime fromMicroseconds(std::uint64_t microseconds, bool interval);
    static DateTime now();

    bool isInterval() const { return text_[21] == ':'; }

    // Microseconds since 1970-01-01T00:00:00Z (0 before it), or of the interval.
    // Insignificant digits count as the lowest value they could have.
    std::uint64_t microseconds() const;

    // The 25 characters.
    const std::string& text() const { return text_; }

    friend bool operator==(const DateTime& a, const DateTime& b) { return a.text_ == b.text_; }
    friend bool operator!=(const DateTime& a, const DateTime& b) { return !(a == b); }

private:
    explicit DateTime(std::string text) : text_(std::move(text)) {}
    std::string text_;
};

} // namespace qelo::cim
