// A scratch root with damaged files in it, read by the real store and served by the real
// provider library.
#pragma once

#include "support/broker/RecordingBroker.h"

#include <filesystem>
#include <gtest/gtest.h>
#include <map>
#include <string>
#include <vector>

namespace qelo::test {

struct ServedClass {
    const char* provider;
    const char* className;
};

inline constexpr ServedClass kServedClasses[] = {
    {"SimAccountProvider", "ZANTH_Account"},
    {"SimGroupProvider", "ZANTH_Group"},
    {"SimIdentityProvider", "ZANTH_SimIdentity"},
    {"SimAccountManagementServiceProvider", "ZANTH_AccountManagementService"},
    {"SimAccountManagementCapabilitiesProvider", "ZANTH_AccountManagementCapabilities"},
    {"SimAccountHostedServiceProvider", "ZANTH_AccountHostedService"},
    {"SimElementCapabilitiesProvider", "ZANTH_SimElementCapabilities"}};

// The properties of an instance with their types and values.
using Properties = std::map<std::string, std::string>;

// What an enumeration of a class has served.
struct Served {
    CMPIrc rc = CMPI_RC_OK;
    std::vector<std::string> names;  // the Name of every path
    std::vector<Instance> instances; // of the same names

    // The properties of the only instance of that name; none when there are none or several.
    Properties propertiesOf(const std::string& name) const;
};

class HostileStore : public testing::Test {
protected:
    void SetUp() override;
    void TearDown() override;

    const std::filesystem::path& root() const { return root_; }

    // Enumerates names and instances, which have to agree; every text is UTF-8.
    Served enumerate(const ServedClass& served);

private:
    CMPIrc run(const ServedClass& served, bool names);

    std::filesystem::path root_;
    RecordingBroker broker_;
    std::map<std::string, const CMPIObjectPath*> classPaths_;
};

} // namespace qelo::test
