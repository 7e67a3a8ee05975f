// The provider of ZANTH_Group.

#include "SimGroupObjFactory.h"

#include "../frame/InstanceOperations.h"
#include "../frame/MethodOperation.h"
#include "../frame/ProviderTables.h"

#include <ClassNames.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimGroupProvider("Corvane.SimGroupProvider");
const UnitTrace unit(loggerSimGroupProvider, "SimGroupProvider");

const CMPIBroker* broker = nullptr;

// A factory's failure is told by the factory alone, so the texts for it stay empty.
struct Groups {
    using Factory = SimGroupFactory;
    static constexpr bool firstFlag = true;
    static constexpr const char* allPathsFailed = "";
    static constexpr const char* allInstancesFailed = "";
    static constexpr const char* oneFailed = "";
    static constexpr const char* key = "Name";
    static constexpr const char* component = "SimGroupProvider";
    static void refresh() { refreshGroupNode(); }
};

CMPIStatus SimGroup_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                      const CMPIObjectPath* ref) {
    return enumInstanceNames<Groups>(PlainLines(unit), {broker, result, ref, nullptr});
}

CMPIStatus SimGroup_EnumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* ref, const char** properties) {
    return enumInstances<Groups>(PlainLines(unit), {broker, result, ref, properties});
}

CMPIStatus SimGroup_GetInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                const CMPIObjectPath* cop, const char** properties) {
    return getInstanceByKeyOrAll<Groups>(PlainLines(unit), {broker, result, cop, properties});
}

// An operation that does nothing but say so.
CMPIStatus told(const PlainLines& lines, CMPIStatus status) {
    return guarded(broker, unit, lines.site(), [&] {
        lines.enter();
        lines.leave();
        return status;
    });
}

CMPIStatus SimGroup_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return told(PlainLines(unit), succeeded);
}

CMPIStatus SimGroup_CreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                   const CMPIObjectPath*, const CMPIInstance*) {
    return told(PlainLines(unit), notSupported);
}

CMPIStatus SimGroup_ModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                   const CMPIObjectPath*, const CMPIInstance*, const char**) {
    return told(PlainLines(unit), notSupported);
}

CMPIStatus SimGroup_DeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                   const CMPIObjectPath*) {
    return told(PlainLines(unit), notSupported);
}

CMPIStatus SimGroup_ExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                              const CMPIObjectPath*, const char*, const char*) {
    return told(PlainLines(unit), notSupported);
}

// Traces nothing of its own.
CMPIStatus SimGroup_InvokeMethod(CMPIMethodMI*, const CMPIContext*, const CMPIResult* result,
                                 const CMPIObjectPath* ref, const char* methodName,
                                 const CMPIArgs* in, CMPIArgs* out) {
    return guarded(broker, unit, TraceSite::here(), [&] {
        refreshGroupNode();
        const CMPIStatus status = executeOn(
            GroupClass, broker, ref, [&] { return executeGroupMethod(methodName, in, out) != 0; });
        returnUint32(result, static_cast<CMPIUint32>(status.rc));
        return status;
    });
}

QELO_METHOD_CLEANUP(SimGroup)

} // namespace

QELO_INSTANCE_MI(SimGroup, SimGroupProvider)
QELO_METHOD_MI(SimGroup, SimGroupProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
