// Methods of groups. Part of the source unit SimGroup.

#include "SimGroup.h"

#include "../store/AdminCommand.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimGroup("Corvane.SimpleIdentityManagementProvider");
const UnitTrace unit(loggerSimGroup, "SimGroup");

} // namespace

int executeGroupMethod(const char* methodName, const CMPIArgs* in, CMPIArgs* out) {
    const TraceSite site = TraceSite::here();
    const CallTrace call(
        unit, parameters(" methodName=", methodName, " inParameters=", in, " outParameters=", out));
    Instrumentation cursor;
    const CommandOutcome outcome = sendCommand(unit, cursor, methodName, in, site);
    if (outcome == CommandOutcome::Refused) {
        return 1; // at once, without an exit line
    }
    return call.leave(outcome == CommandOutcome::NotAccepted ? 1 : 0);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
