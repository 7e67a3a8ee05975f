// The classes that the commands know by name, and which provider serves each of them.
#pragma once

#include <string_view>
#include <vector>

namespace qelo::cli {

constexpr char kAccountClass[] = "ZANTH_Account";
constexpr char kGroupClass[] = "ZANTH_Group";
constexpr char kIdentityClass[] = "ZANTH_SimIdentity";
constexpr char kServiceClass[] = "ZANTH_AccountManagementService";
constexpr char kCapabilitiesClass[] = "ZANTH_AccountManagementCapabilities";
constexpr char kComputerSystemClass[] = "ZANTH_ComputerSystem";

struct KnownClass {
    const char* className;
    const char* provider; // the name in front of _Create_<Type>MI
    const char* library;  // "X" for libX.so.1
    bool association;
    bool methods;
};

// Every class serves instances; `association` and `methods` tell what it serves beside.
const std::vector<KnownClass>& knownClasses();

// Whether the class is an association among the known ones (names ignoring case).
bool isKnownAssociation(std::string_view className);

} // namespace qelo::cli
