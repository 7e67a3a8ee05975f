#include "SimIdentity.h"

#include <exception>
#include <iostream>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

constexpr const char* identifier = "ZANTH:SimIdentity1";

} // namespace

std::string SimIdentity::getInstanceID() { return _instanceID = identifier; }

std::string SimIdentity::getElementName() { return _elementName = identifier; }

unsigned int getSimIdentityInstances(std::vector<SimIdentity>& v) {
    try {
        v.push_back(SimIdentity());
    } catch (const std::exception& failure) {
        std::cerr << failure.what() << std::endl;
        return 1;
    }
    return 0;
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
