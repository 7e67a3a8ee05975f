#include "SimElementCapabilitiesObjFactory.h"

#include <ClassNames.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string
    loggerSimElementCapabilitiesObjFactory("Corvane.SimElementCapabilitiesObjFactory");
const UnitTrace unit(loggerSimElementCapabilitiesObjFactory, "SimElementCapabilitiesObjFactory");

} // namespace

const AssociationShape elementCapabilitiesShape = {
    simElementCapabilitiesClass,
    accountManagementServiceClass,
    "ManagedElement",
    accountManagementCapabilitiesClass,
    "Capabilities",
    nullptr,
    nullptr,
    "Create CMPIObjectPath failed for accountManagementServiceClass.",
    "Create CMPIObjectPath failed for                      ZANTH_SimElementCapabilities.",
    "Create CMPIObjectPath failed for                      ZANTH_SimElementCapabilities"};

const char* SimElementCapabilitiesObjFactory::get_assoc_targetClass_Name(const CMPIBroker* _broker,
                                                                         const CMPIObjectPath* ref,
                                                                         const char* _RefLeftClass,
                                                                         const char* _RefRightClass,
                                                                         CMPIStatus* rc) {
    return associationTargetName(unit, elementCapabilitiesShape, _broker, ref, _RefLeftClass,
                                 _RefRightClass, rc);
}

CMPIObjectPath* SimElementCapabilitiesObjFactory::get_assoc_targetClass_ObjectPath(
    const CMPIBroker* _broker, const CMPIObjectPath* ref, const char* _RefLeftClass,
    const char* _RefRightClass, CMPIStatus* rc) {
    return associationTargetPath(unit, elementCapabilitiesShape, _broker, ref, _RefLeftClass,
                                 _RefRightClass, rc);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
