#include "KnownClasses.h"

#include <cim/ObjectPath.h>

#include <algorithm>

namespace qelo::cli {

const std::vector<KnownClass>& knownClasses() {
    static constexpr char accounts[] = "qelosimpleidentitymanagementprofileprovider";
    static constexpr char computerSystem[] = "qelocomputersystemprovider";
    static const std::vector<KnownClass> classes = {
        {kAccountClass, "SimAccountProvider", accounts, false, true},
        {kGroupClass, "SimGroupProvider", accounts, false, true},
        {kIdentityClass, "SimIdentityProvider", accounts, false, false},
        {kServiceClass, "SimAccountManagementServiceProvider", accounts, false, false},
        {kCapabilitiesClass, "SimAccountManagementCapabilitiesProvider", accounts, false, false},
        {"ZANTH_AccountHostedService", "SimAccountHostedServiceProvider", accounts, true, false},
        {"ZANTH_SimElementCapabilities", "SimElementCapabilitiesProvider", accounts, true, false},
        {kComputerSystemClass, "QeloComputerSystemProvider", computerSystem, false, false},
    };
    return classes;
}

bool isKnownAssociation(std::string_view className) {
    const auto& classes = knownClasses();
    return std::any_of(classes.begin(), classes.end(), [&](const KnownClass& known) {
        return known.association && cim::sameName(known.className, className);
    });
}

} // namespace qelo::cli
