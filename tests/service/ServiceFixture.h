// What the tests of the service and of its capabilities share: the providers under test, and
// the store nodes that both come from.
#pragma once

#include "support/operations/ProviderFixture.h"

#include <string>
#include <vector>

namespace qelo::test {

namespace source {
inline constexpr Unit service{"Corvane.SimAccountManagementServiceObj",
                              "SimAccountManagementService"};
inline constexpr Unit serviceFactory{"Corvane.SimAccountManagementServiceObjFactory",
                                     "SimAccountManagementServiceObjFactory"};
inline constexpr Unit serviceProvider{"Corvane.SimAccountManagementServiceProvider",
                                      "SimAccountManagementServiceProvider"};
inline constexpr Unit capabilitiesFactory{"Corvane.SimAccountManagementCapabilitiesObjFactory",
                                          "SimAccountManagementCapabilitiesObjFactory"};
inline constexpr Unit capabilitiesProvider{"Corvane.SimAccountManagementCapabilitiesProvider",
                                           "SimAccountManagementCapabilitiesProvider"};
} // namespace source

inline constexpr const char* keyMissingText = "At least one key should be passed";
inline constexpr const char* serviceClass = "ZANTH_AccountManagementService";
inline constexpr const char* capabilitiesClass = "ZANTH_AccountManagementCapabilities";

inline StoreNode serviceNode(const std::string& path) {
    return {Tesk::NodeLexicon::AccountServiceRoot, path, {}};
}

// What the recording store prints for that path stands behind the prefix.
inline std::string serviceName(const std::string& path) {
    return "SimAccountManagementService_node:" + path;
}
inline std::string capabilitiesId(const std::string& path) {
    return "SimAccountManagementCapabilities_node:" + path;
}

inline std::vector<NamedValue> serviceKeys(const std::string& path) {
    return {{"SystemCreationClassName", "ZANTH_ComputerSystem"},
            {"SystemName", "host.example"},
            {"CreationClassName", serviceClass},
            {"Name", serviceName(path)}};
}

class ServiceStore : public ProviderFixture {
protected:
    using ProviderFixture::ProviderFixture;

    // A store with a service node for each of these paths.
    void serve(const std::vector<std::string>& paths) {
        for (const std::string& path : paths) {
            platform_.addNode(serviceNode(path));
        }
    }

    // The markers of an operation of that unit; without the exit where it ends early.
    static ExpectedTrace markers(Unit unit, const std::string& function, bool ends,
                                 const std::string& message = "") {
        ExpectedTrace trace;
        trace.providerEntry(unit, function);
        if (!message.empty()) {
            trace.message(unit, function, message);
        }
        return ends ? trace.providerExit(unit, function) : trace;
    }
};

class ServiceFixture : public ServiceStore {
protected:
    ServiceFixture() : ServiceStore({"SimAccountManagementServiceProvider", serviceClass}) {}
};

class CapabilitiesFixture : public ServiceStore {
protected:
    CapabilitiesFixture()
        : ServiceStore({"SimAccountManagementCapabilitiesProvider", capabilitiesClass}) {}
};

} // namespace qelo::test
