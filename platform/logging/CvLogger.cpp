#include "platform/CvLogger.h"

#include "logging/AdmissionCache.h"
#include "logging/LogListener.h"
#include "logging/LoggerCore.h"

#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <exception>

namespace CvLog {
namespace {

using namespace qelo::logging;

constexpr const char* kConfigVariable = "QELO_LOG_CONFIG";
constexpr const char* kDefaultConfigPath = "/etc/qelosim/logging.conf";
constexpr std::chrono::seconds kCheckInterval{1};

// What each thread has of its own, in one piece, so that a line looks it up once. Plain data,
// so that lines of destructors at a thread's very end still find it.
struct ThreadState {
    AdmissionCache admission;
    QeloLogListener listener;
    void* context;
};

thread_local ThreadState threadState;

// Where that is; null before the first line of a thread. Not of the initial-exec model: object
// managers load this library late, when there is no static thread storage left for it.
thread_local ThreadState* ownState = nullptr;

ThreadState& ownThreadState() {
    if (__builtin_expect(ownState == nullptr, 0)) {
        ownState = &threadState;
    }
    return *ownState;
}

// A caller that raised privileges must not let its user's environment choose files.
std::string configPath() {
    const char* path = ::secure_getenv(kConfigVariable);
    return path == nullptr || *path == '\0' ? kDefaultConfigPath : path;
}

// The core below once it is there: one look instead of the passing of a guarded variable.
std::atomic<LoggerCore*> existingCore{nullptr};

// Made by the first line, wherever that comes from, and never destroyed: other libraries log
// while they are loaded and unloaded.
LoggerCore& core() {
    static LoggerCore* const logger = new LoggerCore(configPath(), kCheckInterval);
    existingCore.store(logger, std::memory_order_release);
    return *logger;
}

// Callers log between a failing call and their look at errno.
class ErrnoKeeper {
public:
    ErrnoKeeper() : saved_(errno) {}
    ~ErrnoKeeper() { errno = saved_; }
    ErrnoKeeper(const ErrnoKeeper&) = delete;
    ErrnoKeeper& operator=(const ErrnoKeeper&) = delete;

private:
    int saved_;
};

// Out of memory, the line is lost; what the caller is doing goes on. Not inlined, so that the
// lines that are turned away at once do not pay for the others.
[[gnu::noinline]] void deliver(Channel channel, const Line& line,
                               const std::string& component) noexcept {
    const ErrnoKeeper keeper;
    try {
        LoggerCore& logger = core();
        if (isAdmitted(logger, ownThreadState().admission, channel, component, line.level)) {
            logger.write(channel, line);
        }
    } catch (const std::exception&) {
    }
}

// Nearly every line ends here.
bool isTurnedAway(AdmissionCache& cache, Channel channel, int level) noexcept {
    const LoggerCore* logger = existingCore.load(std::memory_order_acquire);
    return logger != nullptr && cache.turnsAway(*logger, channel, level);
}

} // namespace

void CvLogger::logLevelMessage(const char* function, const char* file, int line,
                               const std::string& component, int level, const char*, int, int,
                               const std::string& message) {
    ThreadState& thread = ownThreadState();
    if (thread.listener != nullptr) {
        thread.listener(thread.context, component.c_str(), level, message.c_str());
    }
    if (!isTurnedAway(thread.admission, Channel::Log, level)) {
        deliver(Channel::Log, {function, file, line, component, level, message}, component);
    }
}

void CvLogger::traceLevelMessage(const char* function, const char* file, int line,
                                 const std::string& component, int level, const char*, int, int,
                                 const std::string& message) {
    if (!isTurnedAway(ownThreadState().admission, Channel::Trace, level)) {
        deliver(Channel::Trace, {function, file, line, component, level, message}, component);
    }
}

} // namespace CvLog

void qelo_setLogListener(QeloLogListener listener, void* context) {
    CvLog::ThreadState& thread = CvLog::ownThreadState();
    thread.listener = listener;
    thread.context = context;
}
