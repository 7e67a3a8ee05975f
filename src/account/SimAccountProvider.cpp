// The provider of ZANTH_Account.

#include "SimAccountObjFactory.h"

#include "../frame/InstanceOperations.h"
#include "../frame/MethodOperation.h"
#include "../frame/ProviderTables.h"

#include <ClassNames.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountProvider("Corvane.SimAccountProvider");
const UnitTrace unit(loggerSimAccountProvider, "SimAccountProvider");

const CMPIBroker* broker = nullptr;

struct Accounts {
    using Factory = SimAccountFactory;
    static constexpr bool firstFlag = true;
    static constexpr const char* allPathsFailed = "getAllSimAccountCMPIObjPaths Failed";
    static constexpr const char* allInstancesFailed = "getAllSimAccountCMPIInstances Failed";
    static constexpr const char* oneFailed = "getOneSimAccountCMPIInstance Failed";
    static constexpr bool everyCallReports = true;
    static constexpr bool exitLineWithoutKeys = true;
    static constexpr const char* key = "Name";
    static void refresh() { refreshGroupUserInfo(); }
};

CMPIStatus SimAccount_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext*,
                                        const CMPIResult* result, const CMPIObjectPath* ref) {
    return enumInstanceNames<Accounts>(MarkerLines(unit), {broker, result, ref, nullptr});
}

CMPIStatus SimAccount_EnumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                    const CMPIObjectPath* ref, const char** properties) {
    return enumInstances<Accounts>(MarkerLines(unit), {broker, result, ref, properties});
}

CMPIStatus SimAccount_GetInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* ref, const char** properties) {
    return getInstanceByKeyOrPath<Accounts>(MarkerLines(unit), {broker, result, ref, properties});
}

CMPIStatus SimAccount_InvokeMethod(CMPIMethodMI*, const CMPIContext*, const CMPIResult* result,
                                   const CMPIObjectPath* ref, const char* methodName,
                                   const CMPIArgs* in, CMPIArgs* out) {
    const MarkerLines lines(unit);
    return guarded(broker, unit, lines.site(), [&] {
        lines.enter();
        refreshGroupUserInfo();
        const CMPIStatus status = executeOn(AccountClass, broker, ref,
                                            [&] { return executeMethod(methodName, in, out); });
        returnUint32(result, 0); // without meaning; the status tells
        lines.leave();
        return status;
    });
}

QELO_READ_ONLY_OPERATIONS(SimAccount)
QELO_METHOD_CLEANUP(SimAccount)

} // namespace

QELO_INSTANCE_MI(SimAccount, SimAccountProvider)
QELO_METHOD_MI(SimAccount, SimAccountProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
