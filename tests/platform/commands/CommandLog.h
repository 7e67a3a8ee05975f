// Stands in for the logging library and keeps the lines written to it.
#pragma once

#include <string>
#include <vector>

namespace qelo::test {

struct LogLine {
    std::string component;
    int level;
    std::string message;
};

// The lines of both sinks since the last call, in any thread.
std::vector<LogLine> takeLogLines();

} // namespace qelo::test
