// The time that every line of a file or terminal begins with.
#pragma once

#include <spdlog/formatter.h>
#include <spdlog/pattern_formatter.h>

#include <memory>

namespace qelo::logging {

// Puts the local time in the ISO 8601 form with milliseconds and zone before a line, and a
// line end after it.
inline std::unique_ptr<spdlog::formatter> makeLineFormatter() {
    return std::make_unique<spdlog::pattern_formatter>("%Y-%m-%dT%H:%M:%S.%e%z %v",
                                                       spdlog::pattern_time_type::local, "\n");
}

} // namespace qelo::logging
