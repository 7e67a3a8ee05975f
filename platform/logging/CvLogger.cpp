#include "platform/CvLogger.h"

#include "logging/AdmissionCache.h"
#include "logging/LogListener.h"
#include "logging/LoggerCore.h"

#include <cerrno>
#include <cstdlib>
#include <exception>

namespace CvLog {
namespace {

using namespace qelo::logging;

constexpr const char* kConfigVariable = "QELO_LOG_CONFIG";
constexpr const char* kDefaultConfigPath = "/etc/qelosim/logging.conf";
constexpr std::chrono::seconds kCheckInterval{1};

thread_local AdmissionCache admissionCache;

// Plain data, so that lines of destructors at a thread's very end still find it.
struct Listening {
    QeloLogListener listener;
    void* context;
};

thread_local Listening listening{nullptr, nullptr};

// A caller that raised privileges must not let its user's environment choose files.
std::string configPath() {
    const char* path = ::secure_getenv(kConfigVariable);
    return path == nullptr || *path == '\0' ? kDefaultConfigPath : path;
}

// Made by the first line, wherever that comes from, and never destroyed: other libraries log
// while they are loaded and unloaded.
LoggerCore& core() {
    static LoggerCore* const logger = new LoggerCore(configPath(), kCheckInterval);
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

// Out of memory, the line is lost; what the caller is doing goes on.
void deliver(Channel channel, const Line& line, const std::string& component) noexcept {
    const ErrnoKeeper keeper;
    try {
        LoggerCore& logger = core();
        if (isAdmitted(logger, admissionCache, channel, component, line.level)) {
            logger.write(channel, line);
        }
    } catch (const std::exception&) {
    }
}

} // namespace

void CvLogger::logLevelMessage(const char* function, const char* file, int line,
                               const std::string& component, int level, const char*, int, int,
                               const std::string& message) {
    if (listening.listener != nullptr) {
        listening.listener(listening.context, component.c_str(), level, message.c_str());
    }
    deliver(Channel::Log, {function, file, line, component, level, message}, component);
}

void CvLogger::traceLevelMessage(const char* function, const char* file, int line,
                                 const std::string& component, int level, const char*, int, int,
                                 const std::string& message) {
    deliver(Channel::Trace, {function, file, line, component, level, message}, component);
}

} // namespace CvLog

void qelo_setLogListener(QeloLogListener listener, void* context) {
    CvLog::listening = {listener, context};
}
