#include "SimAccountManagementCapabilities.h"

#include "../store/RecordLoader.h"

#include <ProviderException.h>

#include <iostream>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

// Values of CIM OperationsSupported and RequestedStatesSupported.
constexpr std::uint16_t operations[] = {2, 3, 4}; // create, modify, delete
constexpr std::uint16_t states[] = {2, 3, 6};     // enabled, disabled, offline

void fillCapabilities(Instrumentation& node, SimAccountManagementCapabilities& capabilities) {
    const std::string id =
        "SimAccountManagementCapabilities_" + node.convertPathToString(node.getPathToNode());
    if (!capabilities.setInstanceID(id)) {
        throw ProviderException("Failed while setting InstanceID.");
    }
    if (!capabilities.setElementName(id)) {
        throw ProviderException("Failed while setting Element Name.");
    }
}

} // namespace

std::string SimAccountManagementCapabilities::getInstanceID() { return _instanceID; }

std::string SimAccountManagementCapabilities::getElementName() { return _elementName; }

bool SimAccountManagementCapabilities::getElementNameEditSupported() {
    return _elementNameEditSupported = false;
}

std::vector<std::uint16_t> SimAccountManagementCapabilities::getOperationsSupported() {
    _operationsSupported.insert(_operationsSupported.end(), std::begin(operations),
                                std::end(operations));
    return _operationsSupported;
}

std::vector<std::uint16_t> SimAccountManagementCapabilities::getRequestedStatesSupported() {
    _requestedStatesSupported.insert(_requestedStatesSupported.end(), std::begin(states),
                                     std::end(states));
    return _requestedStatesSupported;
}

bool SimAccountManagementCapabilities::setInstanceID(std::string instanceID) {
    _instanceID = std::move(instanceID);
    return !_instanceID.empty();
}

bool SimAccountManagementCapabilities::setElementName(std::string elementName) {
    _elementName = std::move(elementName);
    return !_elementName.empty();
}

bool getSimAccountManagementCapabilitiesInstances(
    std::vector<SimAccountManagementCapabilities>& vectSimAccountManagementCapabilities) {
    try {
        Instrumentation cursor;
        cursor.selectNode(NodeLexicon::AccountServiceRoot);
        if (cursor) {
            appendRecords(cursor, vectSimAccountManagementCapabilities, fillCapabilities);
        }
    } catch (const std::exception& failure) {
        std::cerr << failure.what() << std::endl;
        return true;
    }
    return false;
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
