// Logs before main, while threads end, from exit handlers and from static destructors. A line
// of each moment must be in the log; LifeCycleTest looks for them.
#include "platform/CvLogger.h"

#include <cstdlib>
#include <ostream>
#include <thread>

namespace {

void logLine(const char* moment) {
    CvLog::CvMessageBuffer buffer;
    static_cast<std::ostream&>(buffer) << moment;
    CvLog::CvLogger::logLevelMessage("life", "LifeCycle", 1, "Corvane.LifeCycle", 3000, nullptr, 0,
                                     0, buffer.str(buffer));
}

struct Moments {
    const char* begin;
    const char* end;
    Moments(const char* beginning, const char* ending) : begin(beginning), end(ending) {
        logLine(begin);
    }
    ~Moments() { logLine(end); }
    Moments(const Moments&) = delete;
    Moments& operator=(const Moments&) = delete;
};

const Moments process("before main", "static destructor");

thread_local const Moments inThread("thread begins", "thread ends");

void atExit() { logLine("exit handler"); }

} // namespace

int main() {
    (void)std::atexit(atExit);
    std::thread([] { logLine(inThread.begin); }).join();
    logLine(inThread.begin);
    (void)std::atexit([] { logLine("second exit handler"); });
    return 0;
}
