// The account management service, one for each service root in the node store.
#pragma once

#include <Instrumentation.h>

#include <cstdint>
#include <string>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// A value. Getters return the field; setters return true when they refuse the value, which
// none does today. All of them are traced.
class SimAccountManagementService {
public:
    std::string getName();
    std::string getElementName();
    unsigned short getRequestedState();
    unsigned short getEnabledState();

    bool setName(std::string name);
    bool setElementName(std::string elementName);
    bool setRequestedState(unsigned short requestedState);
    bool setEnabledState(unsigned short enabledState);

private:
    std::string _name;
    std::string _elementName;
    std::uint16_t _requestedState = 0;
    std::uint16_t _enabledState = 0;
};

// Appends one record for each service root, in store order. Returns false on success, true
// when there is no service root or the store or a value failed, which is traced.
bool getSimAccountManagementServiceInstances(
    std::vector<SimAccountManagementService>& vectSimAccountManagementService);

// Appends one record for each node from the cursor's position on, and moves the cursor past
// them. Returns false. Throws ProviderException when a record refuses a value, and what the
// store throws.
bool setSimAccountManagementServiceVector(
    std::vector<SimAccountManagementService>& vectSimAccountManagementService,
    Tesk::Instrumentation& instrumentation);

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
