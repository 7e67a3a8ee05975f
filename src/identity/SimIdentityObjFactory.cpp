#include "SimIdentityObjFactory.h"

#include <ClassNames.h>

#include <iterator>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimIdentityObjFactory("Corvane.SimIdentityObjFactory");
const UnitTrace unit(loggerSimIdentityObjFactory, "SimIdentityObjFactory");

constexpr KeyRow<SimIdentity> keys[] = {
    {"InstanceID", key::text<&SimIdentity::getInstanceID>},
};

bool loadIdentity(std::vector<SimIdentity>& records) {
    return getSimIdentityInstances(records) != 0;
}

constexpr PropertyRow<SimIdentity, SimIdentityFactory> table[] = {
    {"ElementName", property::chars<&SimIdentity::getElementName>},
};

} // namespace

const SimIdentityFactory::Shape& SimIdentityFactory::shape() {
    static const Shape shape = {
        unit,
        IdentityClass,
        "SimIdentityProvider",
        loadIdentity,
        &SimIdentity::getInstanceID,
        SameKey::IsDropped,
        keys,
        table,
        std::size(table),
        2,
        "Create CMPIObjectPath failed",
        "Create CMPIObjectPath failed for                     SimIdentity class",
        " simidentity=",
        " IsObjPath=",
        true,
        false,
        1,
        {false, false, false}};
    return shape;
}

SimIdentityFactory::SimIdentityFactory() { unit.method(); }

SimIdentityFactory::SimIdentityFactory(bool, bool) {
    unit.entering();
    load();
    unit.exiting();
}

SimIdentityFactory::~SimIdentityFactory() { unit.methodQuietly(); }

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
