#include "SimAccountManagementService.h"

#include "../store/RecordLoader.h"

#include <ProviderException.h>
#include <UnitTrace.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountManagementService("Corvane.SimAccountManagementServiceObj");
const UnitTrace unit(loggerSimAccountManagementService, "SimAccountManagementService");

constexpr unsigned short requestedStateNotApplicable = 12;
constexpr unsigned short enabledStateEnabled = 2;

// A setter of this class: as any other, and it tells that it was invoked.
template <class Field, class Value>
bool assignTold(const char* piece, const char* name, Field& field, Value value,
                TraceSite site = TraceSite::here()) {
    const CallTrace call(unit, parameters(piece, value), site);
    unit.method(site);
    field = std::move(value);
    unit.variable(name, field, site);
    return call.leave(false, site);
}

void require(bool refused, const char* message) {
    if (refused) {
        throw ProviderException(message);
    }
}

void fillService(Instrumentation& node, SimAccountManagementService& service) {
    const std::string name =
        "SimAccountManagementService_" + node.convertPathToString(node.getPathToNode());
    require(service.setName(name), "Failed while setting Name");
    require(service.setRequestedState(requestedStateNotApplicable),
            "Failed while setting RequestedState");
    require(service.setEnabledState(enabledStateEnabled), "Failed while setting EnabledState");
    require(service.setElementName(name), "Failed while setting ElementName");
}

} // namespace

std::string SimAccountManagementService::getName() { return unit.read("_name", _name); }
std::string SimAccountManagementService::getElementName() {
    return unit.read("_elementName", _elementName);
}
unsigned short SimAccountManagementService::getRequestedState() {
    return unit.read("_requestedState", _requestedState);
}
unsigned short SimAccountManagementService::getEnabledState() {
    return unit.read("_enabledState", _enabledState);
}

bool SimAccountManagementService::setName(std::string name) {
    return assignTold(" name=", "_name", _name, std::move(name));
}
bool SimAccountManagementService::setElementName(std::string elementName) {
    return assignTold(" elementName=", "_elementName", _elementName, std::move(elementName));
}
bool SimAccountManagementService::setRequestedState(unsigned short requestedState) {
    return assignTold(" requestedState=", "_requestedState", _requestedState, requestedState);
}
bool SimAccountManagementService::setEnabledState(unsigned short enabledState) {
    return assignTold(" enabledState=", "_enabledState", _enabledState, enabledState);
}

bool setSimAccountManagementServiceVector(
    std::vector<SimAccountManagementService>& vectSimAccountManagementService,
    Tesk::Instrumentation& instrumentation) {
    appendRecords(instrumentation, vectSimAccountManagementService, fillService);
    return false;
}

bool getSimAccountManagementServiceInstances(
    std::vector<SimAccountManagementService>& vectSimAccountManagementService) {
    const CallTrace call(
        unit, parameters(" vectSimAccountManagementService=", &vectSimAccountManagementService));
    bool failed = true;
    try {
        Instrumentation cursor;
        cursor.selectNode(NodeLexicon::AccountServiceRoot);
        if (cursor) {
            setSimAccountManagementServiceVector(vectSimAccountManagementService, cursor);
            failed = false;
        }
    } catch (const std::exception& failure) {
        unit.message(failure.what());
    }
    return call.leave(failed);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
