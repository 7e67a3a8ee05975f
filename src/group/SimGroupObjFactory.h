// Turns group records into CIM objects of class ZANTH_Group.
#pragma once

#include "SimGroup.h"

#include "../frame/ObjFactory.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

class SimGroupFactory : public ObjFactory<SimGroup, SimGroupFactory> {
public:
    // Empty; reads nothing.
    SimGroupFactory();

    // Reads all groups from the node store; of groups with the same name the first stays.
    // The flags are ignored.
    SimGroupFactory(bool, bool);

    ~SimGroupFactory();

    QELO_FACTORY_MEMBERS(SimGroup)
    static const Shape& shape();
};

// Asks the node store to re-read users and groups when its count of groups differs from the
// number of group nodes. Never fails; a failure is traced.
void refreshGroupNode();

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
