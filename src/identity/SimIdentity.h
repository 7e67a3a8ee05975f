// The one identity of the system. It is a constant and touches no store.
#pragma once

#include <string>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// A value whose fields are filled when they are first asked for. Not traced.
class SimIdentity {
public:
    // Each stores the constant identifier in its field and returns a copy.
    std::string getInstanceID();
    std::string getElementName();

private:
    std::string _instanceID;
    std::string _elementName;
};

// Appends the one identity. Returns 0; 1 when that failed, which is told on standard error.
unsigned int getSimIdentityInstances(std::vector<SimIdentity>& v);

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
