// The log as the store sees it in these tests: it stands in for the logging library.
#pragma once

#include <string>
#include <vector>

namespace qelo::nodes::tests {

struct LoggedLine {
    std::string component;
    int level;
    std::string text;
};

// The lines since the last clearLog().
std::vector<LoggedLine> loggedLines();
std::vector<std::string> loggedTexts();
void clearLog();

} // namespace qelo::nodes::tests
