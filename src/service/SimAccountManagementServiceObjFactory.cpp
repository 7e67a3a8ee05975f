#include "SimAccountManagementServiceObjFactory.h"

#include <ClassNames.h>
#include <platform/TeskCommon.h>

#include <iterator>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string
    loggerSimAccountManagementServiceObjFactory("Corvane.SimAccountManagementServiceObjFactory");
const UnitTrace unit(loggerSimAccountManagementServiceObjFactory,
                     "SimAccountManagementServiceObjFactory");

std::vector<KeyText> keysOf(SimAccountManagementService& service) {
    return {{"SystemCreationClassName", ComputerSystemClass},
            {"SystemName", getSystemName()},
            {"CreationClassName", accountManagementServiceClass},
            {"Name", service.getName()}};
}

using Service = SimAccountManagementService;
using namespace property;

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
        keysOf,
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
