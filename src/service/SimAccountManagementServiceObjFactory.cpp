#include "SimAccountManagementServiceObjFactory.h"

#include <ClassNames.h>

#include <iterator>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string
    loggerSimAccountManagementServiceObjFactory("Corvane.SimAccountManagementServiceObjFactory");
const UnitTrace unit(loggerSimAccountManagementServiceObjFactory,
                     "SimAccountManagementServiceObjFactory");

using Service = SimAccountManagementService;
using namespace property;

constexpr KeyRow<Service> keys[] = {
    {"SystemCreationClassName", key::fixed<ComputerSystemClass>},
    {"SystemName", key::systemName},
    {"CreationClassName", key::fixed<accountManagementServiceClass>},
    {"Name", key::text<&Service::getName>},
};

constexpr PropertyRow<Service, SimAccountManagementServiceFactory> table[] = {
    {"Caption", caption},
    {"Description", chars<&Service::getElementName>},
    {"ElementName", chars<&Service::getElementName>},
    {"RequestedState", uint16<&Service::getRequestedState>},
    {"EnabledState", uint16<&Service::getEnabledState>},
};

} // namespace

const SimAccountManagementServiceFactory::Shape& SimAccountManagementServiceFactory::shape() {
    static const Shape shape = {
        unit,
        accountManagementServiceClass,
        "SimAccountManagementServiceProvider",
        getSimAccountManagementServiceInstances,
        &Service::getName,
        SameKey::Replaces,
        keys,
        table,
        std::size(table),
        1,
        "Create CMPIObjectPath failed.",
        "Create CMPIObjectPath                     failed for RecordLogClass.",
        " simAccountManagementService=",
        " isObjPath=",
        false,
        false,
        0,
        {true, false, true}};
    return shape;
}

SimAccountManagementServiceFactory::SimAccountManagementServiceFactory() { unit.method(); }

SimAccountManagementServiceFactory::SimAccountManagementServiceFactory(bool isCap, bool isSen) {
    const CallTrace call(unit, parameters(" isCap=", isCap, " isSen=", isSen));
    load();
    call.leave();
}

SimAccountManagementServiceFactory::~SimAccountManagementServiceFactory() { unit.methodQuietly(); }

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
