// The provider of ZANTH_AccountManagementService.

#include "SimAccountManagementServiceObjFactory.h"

#include "../frame/InstanceOperations.h"
#include "../frame/ProviderTables.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string
    loggerSimAccountManagementServiceProvider("Corvane.SimAccountManagementServiceProvider");
const UnitTrace unit(loggerSimAccountManagementServiceProvider,
                     "SimAccountManagementServiceProvider");

const CMPIBroker* broker = nullptr;

struct Services {
    using Factory = SimAccountManagementServiceFactory;
    static constexpr bool firstFlag = true;
    static constexpr const char* allPathsFailed =
        "getAllSimAccountManagementServiceCMPIObjPaths Failed";
    static constexpr const char* allInstancesFailed =
        "getAllSimAccountManagementServiceCMPIInstances Failed";
    static constexpr const char* oneFailed = "getOneSimAccountManagementServiceCMPIInstance Failed";
    static constexpr bool everyCallReports = false;
    static constexpr bool exitLineWithoutKeys = false;
    static constexpr const char* key = "Name";
    static void refresh() {} // read from the store anew each time, with no count to compare
};

CMPIStatus SimAccountManagementService_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext*,
                                                         const CMPIResult* rslt,
                                                         const CMPIObjectPath* ref) {
    return enumInstanceNames<Services>(MarkerLines(unit), {broker, rslt, ref, nullptr});
}

CMPIStatus SimAccountManagementService_EnumInstances(CMPIInstanceMI*, const CMPIContext*,
                                                     const CMPIResult* rslt,
                                                     const CMPIObjectPath* ref,
                                                     const char** properties) {
    return enumInstances<Services>(MarkerLines(unit), {broker, rslt, ref, properties});
}

CMPIStatus SimAccountManagementService_GetInstance(CMPIInstanceMI*, const CMPIContext*,
                                                   const CMPIResult* rslt,
                                                   const CMPIObjectPath* cop,
                                                   const char** properties) {
    return getInstanceByKeyOrPath<Services>(MarkerLines(unit), {broker, rslt, cop, properties});
}

QELO_READ_ONLY_OPERATIONS(SimAccountManagementService)

} // namespace

QELO_INSTANCE_MI(SimAccountManagementService, SimAccountManagementServiceProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
