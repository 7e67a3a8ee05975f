// Dates of commands: a CIM date and time as a day number of the shadow file.
#pragma once

#include "Attempt.h"

#include <string_view>

namespace qelo::store {

// The day on which the moment `text` lies in UTC, in days since 1970-01-01.
// `text` has the 25 characters yyyymmddhhmmss.mmmmmmsutc; the microseconds may be masked by
// asterisks. Refused are intervals, other masked digits, dates that no calendar has, and
// moments before 1970. Pure; for any thread.
Attempt<long> dayOfDateTime(std::string_view text);

} // namespace qelo::store
