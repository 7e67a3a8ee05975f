// The CIM classes of the profile, and the names under which providers speak to the broker.
// Each source unit gets a copy of its own.
#pragma once

namespace Tesk {
namespace SimpleIdentityManagementProvider {

constexpr const char* AccountClass = "ZANTH_Account";
constexpr const char* GroupClass = "ZANTH_Group";
constexpr const char* IdentityClass = "ZANTH_SimIdentity";
constexpr const char* accountManagementServiceClass = "ZANTH_AccountManagementService";
constexpr const char* accountManagementCapabilitiesClass = "ZANTH_AccountManagementCapabilities";
constexpr const char* accountHostedServiceClass = "ZANTH_AccountHostedService";
constexpr const char* simElementCapabilitiesClass = "ZANTH_SimElementCapabilities";
constexpr const char* ComputerSystemClass = "ZANTH_ComputerSystem";

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
