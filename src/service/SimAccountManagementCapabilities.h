// What an account management service can do; one for each service root in the node store.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// A value. Setters return true when they took the value, which must not be empty. The two
// list getters append their values on every call, so a record is asked for each list once.
// Not traced.
class SimAccountManagementCapabilities {
public:
    std::string getInstanceID();
    std::string getElementName();
    bool getElementNameEditSupported();                       // always false
    std::vector<std::uint16_t> getOperationsSupported();      // create, modify, delete
    std::vector<std::uint16_t> getRequestedStatesSupported(); // enabled, disabled, offline

    bool setInstanceID(std::string instanceID);
    bool setElementName(std::string elementName);

private:
    std::string _instanceID;
    std::vector<std::uint16_t> _requestedStatesSupported;
    bool _elementNameEditSupported = false;
    std::string _elementName;
    std::vector<std::uint16_t> _operationsSupported;
};

// Appends one record for each service root, in store order. Returns false on success, also
// when there is none; true when the store or a value failed, which is told on standard error.
bool getSimAccountManagementCapabilitiesInstances(
    std::vector<SimAccountManagementCapabilities>& vectSimAccountManagementCapabilities);

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
