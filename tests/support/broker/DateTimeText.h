// The 25 characters of a CIM datetime.
#pragma once

#include <cstdint>
#include <string>

namespace qelo::test {

// yyyymmddhhmmss.mmmmmm+uuu with fields in their range, or ddddddddhhmmss.mmmmmm:000. A
// whole field may be asterisks, and so may the end of the microseconds.
bool isDateTimeText(const std::string& text);

bool isIntervalText(const std::string& text);

// Microseconds since 1970-01-01 UTC, or of the interval; asterisks count as the least value.
// Only for texts that isDateTimeText accepts.
std::uint64_t binaryOfDateTimeText(const std::string& text);

// The reverse, for UTC.
std::string dateTimeTextOf(std::uint64_t microseconds, bool interval);

} // namespace qelo::test
