#include "SimAccountHostedServiceObjFactory.h"

#include <ClassNames.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string
    loggerSimAccountHostedServiceObjFactory("Corvane.SimAccountHostedServiceObjFactory");
const UnitTrace unit(loggerSimAccountHostedServiceObjFactory, "SimAccountHostedServiceObjFactory");

} // namespace

const AssociationShape hostedServiceShape = {
    accountHostedServiceClass,
    ComputerSystemClass,
    "Antecedent",
    accountManagementServiceClass,
    "Dependent",
    "CIM_ComputerSystem",
    "CIM_AccountManagementService",
    "Create CMPIObjectPath failed for ComputerSystemClass.",
    "Create CMPIObjectPath failed for                      ZANTH_SimAccountHostedService.",
    "Create CMPIObjectPath failed for                      ZANTH_SimAccountHostedService"};

const char* SimAccountHostedServiceObjFactory::get_assoc_targetClass_Name(
    const CMPIBroker* _broker, const CMPIObjectPath* ref, const char* _RefLeftClass,
    const char* _RefRightClass, CMPIStatus* rc) {
    return associationTargetName(unit, hostedServiceShape, _broker, ref, _RefLeftClass,
                                 _RefRightClass, rc);
}

CMPIObjectPath* SimAccountHostedServiceObjFactory::get_assoc_targetClass_ObjectPath(
    const CMPIBroker* _broker, const CMPIObjectPath* ref, const char* _RefLeftClass,
    const char* _RefRightClass, CMPIStatus* rc) {
    return associationTargetPath(unit, hostedServiceShape, _broker, ref, _RefLeftClass,
                                 _RefRightClass, rc);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
