// The provider of ZANTH_SimIdentity.

#include "SimIdentityObjFactory.h"

#include "../frame/InstanceOperations.h"
#include "../frame/ProviderTables.h"

#include <ClassNames.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimIdentityProvider("Corvane.SimIdentityProvider");
const UnitTrace unit(loggerSimIdentityProvider, "SimIdentityProvider");

const CMPIBroker* broker = nullptr;

// A factory's failure is told by the factory alone, so the texts for it stay empty.
struct Identities {
    using Factory = SimIdentityFactory;
    static constexpr bool firstFlag = false;
    static constexpr const char* allPathsFailed = "";
    static constexpr const char* allInstancesFailed = "";
    static constexpr const char* oneFailed = "";
    static constexpr const char* key = "InstanceID";
    static constexpr const char* component = "SimIdentityProvider";
    static void refresh() {} // a constant is never stale
};

CMPIStatus SimIdentity_EnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                         const CMPIResult* result, const CMPIObjectPath* ref) {
    const ParameterLines lines(unit, [=] {
        return parameters(" mi=", mi, " ctx=", ctx, " result=", result, " ref=", ref);
    });
    return enumInstanceNames<Identities>(lines, {broker, result, ref, nullptr});
}

CMPIStatus SimIdentity_EnumInstances(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* result, const CMPIObjectPath* ref,
                                     const char** properties) {
    const ParameterLines lines(unit, [=] {
        return parameters(" mi=", mi, " ctx=", ctx, " result=", result, " ref=", ref,
                          " properties=", properties);
    });
    return enumInstances<Identities>(lines, {broker, result, ref, properties});
}

CMPIStatus SimIdentity_GetInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                   const CMPIResult* result, const CMPIObjectPath* cop,
                                   const char** properties) {
    const ParameterLines lines(unit, [=] {
        return parameters(" mi=", mi, " ctx=", ctx, " result=", result, " cop=", cop,
                          " properties=", properties);
    });
    return getInstanceByKeyOrAll<Identities>(lines, {broker, result, cop, properties});
}

QELO_READ_ONLY_OPERATIONS(SimIdentity)

} // namespace

QELO_INSTANCE_MI(SimIdentity, SimIdentityProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
