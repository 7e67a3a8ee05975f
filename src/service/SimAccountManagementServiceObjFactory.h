// Turns service records into CIM objects of class ZANTH_AccountManagementService.
#pragma once

#include "SimAccountManagementService.h"

#include "../frame/ObjFactory.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

class SimAccountManagementServiceFactory
    : public ObjFactory<SimAccountManagementService, SimAccountManagementServiceFactory> {
public:
    // Empty; reads nothing.
    SimAccountManagementServiceFactory();

    // Reads all services from the node store; of services with the same name the last
    // stays. The flags are traced and change nothing.
    SimAccountManagementServiceFactory(bool isCap, bool isSen);

    ~SimAccountManagementServiceFactory();

    QELO_FACTORY_MEMBERS(SimAccountManagementService)
    static const Shape& shape();
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
