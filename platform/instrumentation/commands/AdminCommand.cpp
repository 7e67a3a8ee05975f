#include "AdminCommand.h"

#include "CommandExecutor.h"

#include "platform/CvLogger.h"

#include <exception>
#include <new>
#include <utility>

namespace qelo::store {

namespace {

constexpr int kFailureLevel = 6000;

CommandOutcome fail(const std::string& reason) {
    logRefusedCommand(reason);
    return {false, reason};
}

} // namespace

CommandOutcome executeAdminCommand(const std::filesystem::path& root, const std::string& command) {
    try {
        Attempt<std::string> status = executeCommand(root, command, systemFiles(), systemTools());
        return status ? CommandOutcome{true, std::move(*status)} : fail(status.reason());
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const std::exception&) {
        // Its text may be about a path or a value; that there was one is all that is said.
        return fail("an unexpected error");
    }
}

void logRefusedCommand(const std::string& reason) {
    static const std::string component = kCommandComponent;
    const std::string message = kRefusalPrefix + reason;
    CvLog::CvLogger::logLevelMessage("executeAdminCommand", "AdminCommand", __LINE__, component,
                                     kFailureLevel, nullptr, 0, 0, message);
    CvLog::CvLogger::traceLevelMessage("executeAdminCommand", "AdminCommand", __LINE__, component,
                                       kFailureLevel, nullptr, 0, 0, message);
}

} // namespace qelo::store
