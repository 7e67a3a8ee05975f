// The provider of ZANTH_SimElementCapabilities, which ties each service to each capabilities
// object.

#include "AssociationProvider.h"
#include "SimElementCapabilitiesObjFactory.h"

#include "../service/SimAccountManagementCapabilitiesObjFactory.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimElementCapabilities("Corvane.SimElementCapabilitiesProvider");
const UnitTrace unit(loggerSimElementCapabilities, "SimElementCapabilitiesProvider");

const CMPIBroker* broker = nullptr;

bool SimElementCapabilitiesCMPIInstances(const CMPIObjectPath* ref, const char** properties,
                                         const CMPIContext* ctx,
                                         std::vector<CMPIInstance*>& instances, CMPIStatus* status);

struct Association {
    using Factory = SimAccountManagementCapabilitiesFactory;
    using Utility = SimElementCapabilitiesObjFactory;
    static const AssociationShape& shape() { return elementCapabilitiesShape; }
    static constexpr auto build = SimElementCapabilitiesCMPIInstances;
};

// Appends an instance for every pair; false when a step failed, `status` then being what it left.
bool SimElementCapabilitiesCMPIInstances(const CMPIObjectPath* ref, const char** properties,
                                         const CMPIContext* ctx,
                                         std::vector<CMPIInstance*>& instances,
                                         CMPIStatus* status) {
    return buildInstances<Association>(MarkerLines(unit), {broker, ctx, nullptr, ref, properties},
                                       instances, status);
}

QELO_ASSOCIATION_OPERATIONS(SimElementCapabilities, Association)

} // namespace

QELO_INSTANCE_MI(SimElementCapabilities, SimElementCapabilitiesProvider)
QELO_ASSOCIATION_MI(SimElementCapabilities, SimElementCapabilitiesProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
