// The provider of ZANTH_AccountHostedService, which ties each computer system to each service.

#include "AssociationProvider.h"
#include "SimAccountHostedServiceObjFactory.h"

#include "../service/SimAccountManagementServiceObjFactory.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountHostedService("Corvane.SimAccountHostedServiceProvider");
const UnitTrace unit(loggerSimAccountHostedService, "SimAccountHostedServiceProvider");

const CMPIBroker* broker = nullptr;

bool SimAccountHostedServiceCMPIInstances(const CMPIObjectPath* ref, const char** properties,
                                          const CMPIContext* ctx,
                                          std::vector<CMPIInstance*>& instances,
                                          CMPIStatus* status);

struct Association {
    using Factory = SimAccountManagementServiceFactory;
    using Utility = SimAccountHostedServiceObjFactory;
    static const AssociationShape& shape() { return hostedServiceShape; }
    static constexpr auto build = SimAccountHostedServiceCMPIInstances;
};

// Appends an instance for every pair; false when a step failed, `status` then being what it left.
bool SimAccountHostedServiceCMPIInstances(const CMPIObjectPath* ref, const char** properties,
                                          const CMPIContext* ctx,
                                          std::vector<CMPIInstance*>& instances,
                                          CMPIStatus* status) {
    return buildInstances<Association>(MarkerLines(unit), {broker, ctx, nullptr, ref, properties},
                                       instances, status);
}

QELO_ASSOCIATION_OPERATIONS(SimAccountHostedService, Association)

} // namespace

QELO_INSTANCE_MI(SimAccountHostedService, SimAccountHostedServiceProvider)
QELO_ASSOCIATION_MI(SimAccountHostedService, SimAccountHostedServiceProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
