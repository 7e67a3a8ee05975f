#include "TestLog.h"

#include <platform/CvLogger.h>

#include <mutex>

namespace {

std::mutex mutex;
std::vector<qelo::nodes::tests::LoggedLine> lines;

} // namespace

namespace CvLog {

void CvLogger::logLevelMessage(const char*, const char*, int, const std::string& component,
                               int level, const char*, int, int, const std::string& message) {
    const std::lock_guard<std::mutex> lock(mutex);
    lines.push_back({component, level, message});
}

void CvLogger::traceLevelMessage(const char*, const char*, int, const std::string&, int,
                                 const char*, int, int, const std::string&) {}

} // namespace CvLog

namespace qelo::nodes::tests {

std::vector<LoggedLine> loggedLines() {
    const std::lock_guard<std::mutex> lock(mutex);
    return lines;
}

std::vector<std::string> loggedTexts() {
    std::vector<std::string> texts;
    for (const LoggedLine& line : loggedLines()) {
        texts.push_back(line.text);
    }
    return texts;
}

void clearLog() {
    const std::lock_guard<std::mutex> lock(mutex);
    lines.clear();
}

} // namespace qelo::nodes::tests
