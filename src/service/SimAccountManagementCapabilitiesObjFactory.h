// Turns capabilities records into CIM objects of class ZANTH_AccountManagementCapabilities.
#pragma once

#include "SimAccountManagementCapabilities.h"

#include "../frame/ObjFactory.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

class SimAccountManagementCapabilitiesFactory
    : public ObjFactory<SimAccountManagementCapabilities, SimAccountManagementCapabilitiesFactory> {
public:
    // Empty; reads nothing.
    SimAccountManagementCapabilitiesFactory();

    // Reads all capabilities from the node store; of those with the same identifier the last
    // stays. The flags are ignored.
    SimAccountManagementCapabilitiesFactory(bool, bool);

    ~SimAccountManagementCapabilitiesFactory();

    QELO_FACTORY_MEMBERS(SimAccountManagementCapabilities)
    static const Shape& shape();
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
