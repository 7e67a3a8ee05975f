#include "CommandLog.h"

#include "platform/CvLogger.h"

#include <mutex>
#include <utility>

namespace {

std::mutex linesMutex;
std::vector<qelo::test::LogLine> lines;

void keep(const std::string& component, int level, const std::string& message) {
    const std::lock_guard<std::mutex> held(linesMutex);
    lines.push_back({component, level, message});
}

} // namespace

namespace CvLog {

void CvLogger::logLevelMessage(const char*, const char*, int, const std::string& component,
                               int level, const char*, int, int, const std::string& message) {
    keep(component, level, message);
}

void CvLogger::traceLevelMessage(const char*, const char*, int, const std::string& component,
                                 int level, const char*, int, int, const std::string& message) {
    keep(component, level, message);
}

} // namespace CvLog

namespace qelo::test {

std::vector<LogLine> takeLogLines() {
    const std::lock_guard<std::mutex> held(linesMutex);
    return std::exchange(lines, {});
}

} // namespace qelo::test
