// Methods of accounts. Part of the source unit SimAccount.

#include "SimAccount.h"

#include "../store/AdminCommand.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccount("Corvane.SimAccountObj");
const UnitTrace unit(loggerSimAccount, "SimAccount");

// Whether the store's status text says that the command failed. A status that speaks of a
// password is not traced.
bool statusSaysFailed(Instrumentation& cursor, TraceSite site) {
    std::string status;
    if (!cursor.getProperty(NodeLexicon::AdminCommand, status)) {
        return false;
    }
    if (status.find("Password") == std::string::npos) {
        unit.variable("createUserStatus", status, site);
    }
    return status.empty();
}

} // namespace

bool executeMethod(const char* methodName, const CMPIArgs* in, CMPIArgs* out) {
    const TraceSite site = TraceSite::here();
    const CallTrace call(
        unit, parameters(" methodName=", methodName, " inParameters=", in, " outParameters=", out));
    Instrumentation cursor;
    switch (sendCommand(unit, cursor, methodName, in, site)) {
    case CommandOutcome::Refused:
        return true; // at once, without an exit line
    case CommandOutcome::NotAccepted:
        return call.leave(true);
    case CommandOutcome::Accepted:
        return call.leave(statusSaysFailed(cursor, site));
    case CommandOutcome::NoAdministration:
        break;
    }
    return call.leave(false);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
