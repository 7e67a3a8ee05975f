#include "Report.h"

#include "Text.h"

#include <platform/CvLogger.h>

namespace qelo::nodes {

namespace {

constexpr int failureLevel = 6000;

} // namespace

void logFailure(const std::string& text) {
    static const std::string component = "Qelo.NodeStore";
    CvLog::CvLogger::logLevelMessage(__func__, "NodeStore", __LINE__, component, failureLevel,
                                     nullptr, 0, 0, printable(text));
}

bool Reporter::isNew(const FileReport& report) {
    const std::lock_guard<std::mutex> lock(mutex_);
    Told& told = told_[report.path];
    if (told == Told(report.stamp, report.text)) {
        return false;
    }
    told = {report.stamp, report.text};
    return true;
}

void Reporter::tell(const Snapshot& snapshot) {
    for (const FileReport& report : snapshot.reports) {
        if (isNew(report)) {
            logFailure(report.path + ": " + report.text);
        }
    }
}

} // namespace qelo::nodes
