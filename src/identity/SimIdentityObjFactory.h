// Turns the identity into CIM objects of class ZANTH_SimIdentity.
#pragma once

#include "SimIdentity.h"

#include "../frame/ObjFactory.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

class SimIdentityFactory : public ObjFactory<SimIdentity, SimIdentityFactory> {
public:
    // Empty.
    SimIdentityFactory();

    // Holds the one identity. The flags are ignored.
    SimIdentityFactory(bool, bool);

    ~SimIdentityFactory();

    QELO_FACTORY_MEMBERS(SimIdentity)
    static const Shape& shape();
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
