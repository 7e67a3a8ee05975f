// The provider of ZANTH_AccountManagementCapabilities.

#include "SimAccountManagementCapabilitiesObjFactory.h"

#include "../frame/InstanceOperations.h"
#include "../frame/ProviderTables.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountManagementCapabilitiesProvider(
    "Corvane.SimAccountManagementCapabilitiesProvider");
const UnitTrace unit(loggerSimAccountManagementCapabilitiesProvider,
                     "SimAccountManagementCapabilitiesProvider");

const CMPIBroker* broker = nullptr;

struct Capabilities {
    using Factory = SimAccountManagementCapabilitiesFactory;
    static constexpr bool firstFlag = true;
    static constexpr const char* allPathsFailed =
        "getAllSimAccountManagementCapabilitiesCMPIObjPaths Failed";
    static constexpr const char* allInstancesFailed =
        "getAllSimAccountManagementCapabilitiesCMPIInstances Failed";
    static constexpr const char* oneFailed =
        "getOneSimAccountManagementCapabilitiesCMPIInstance Failed";
    static constexpr bool everyCallReports = false;
    static constexpr bool exitLineWithoutKeys = false;
    static constexpr const char* key = "InstanceID";
    static void refresh() {} // read from the store anew each time, with no count to compare
};

CMPIStatus SimAccountManagementCapabilities_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext*,
                                                              const CMPIResult* rslt,
                                                              const CMPIObjectPath* ref) {
    return enumInstanceNames<Capabilities>(MarkerLines(unit), {broker, rslt, ref, nullptr});
}

CMPIStatus SimAccountManagementCapabilities_EnumInstances(CMPIInstanceMI*, const CMPIContext*,
                                                          const CMPIResult* rslt,
                                                          const CMPIObjectPath* ref,
                                                          const char** properties) {
    return enumInstances<Capabilities>(MarkerLines(unit), {broker, rslt, ref, properties});
}

CMPIStatus SimAccountManagementCapabilities_GetInstance(CMPIInstanceMI*, const CMPIContext*,
                                                        const CMPIResult* rslt,
                                                        const CMPIObjectPath* cop,
                                                        const char** properties) {
    return getInstanceByKeyOrPath<Capabilities>(MarkerLines(unit), {broker, rslt, cop, properties});
}

QELO_READ_ONLY_OPERATIONS(SimAccountManagementCapabilities)

} // namespace

QELO_INSTANCE_MI(SimAccountManagementCapabilities, SimAccountManagementCapabilitiesProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
