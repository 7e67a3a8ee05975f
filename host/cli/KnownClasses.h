// The classes that the commands know by name.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace qelo::cli {

constexpr char kAccountClass[] = "ZANTH_Account";
constexpr char kGroupClass[] = "ZANTH_Group";
constexpr char kIdentityClass[] = "ZANTH_SimIdentity";
constexpr char kServiceClass[] = "ZANTH_AccountManagementService";
constexpr char kCapabilitiesClass[] = "ZANTH_AccountManagementCapabilities";
constexpr char kComputerSystemClass[] = "ZANTH_ComputerSystem";

// The association classes.
const std::vector<std::string>& knownAssociations();

// Whether the class is an association among the known ones (names ignoring case).
bool isKnownAssociation(std::string_view className);

} // namespace qelo::cli
