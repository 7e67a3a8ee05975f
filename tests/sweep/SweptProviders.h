// The seven providers behind the library's eleven factory functions, with a broker and a
// platform that can be made to fail, and something to serve for each of them.
#pragma once

#include "support/broker/RecordingBroker.h"
#include "support/platform/RecordingPlatform.h"

#include <array>
#include <cstddef>
#include <functional>
#include <map>
#include <string>
#include <vector>

namespace qelo::test {

// The providers by the names they are registered under.
inline constexpr std::array<const char*, 7> sweptProviders = {
    "SimAccountProvider",
    "SimGroupProvider",
    "SimIdentityProvider",
    "SimAccountManagementServiceProvider",
    "SimAccountManagementCapabilitiesProvider",
    "SimAccountHostedServiceProvider",
    "SimElementCapabilitiesProvider"};

// The interfaces of one provider; null where it registers none of that kind.
struct Interfaces {
    CMPIInstanceMI* instances = nullptr;
    CMPIMethodMI* methods = nullptr;
    CMPIAssociationMI* associations = nullptr;
};

// What one run of an operation left behind.
struct SweptRun {
    Outcome outcome;
    bool threw = false;
    unsigned int done = 0; // calls of returnDone, failed ones included
    std::vector<std::string> delivered;
};

struct SweptOperation {
    std::string name;
    std::function<CMPIStatus(const CMPIContext*, const CMPIResult*)> call;
    // Results at most when something fails; 0 is as many as a good run delivers.
    std::size_t most = 0;
    // Whether two results of one run can be told from each other.
    bool distinct = true;
};

class SweptProviders {
public:
    SweptProviders();
    ~SweptProviders();
    SweptProviders(const SweptProviders&) = delete;
    SweptProviders& operator=(const SweptProviders&) = delete;

    // A store as the operations find it at first: two accounts, groups and service nodes.
    void prepareStore();
    // Forgets what was recorded, so that scripted answers and counts begin again.
    void restart() { platform_.forget(); }

    SweptRun run(const SweptOperation& operation);

    RecordingBroker& broker() { return broker_; }
    RecordingPlatform& platform() { return platform_; }
    const Interfaces& interfaces(const std::string& provider) const {
        return interfaces_.at(provider);
    }

private:
    void registerAll(const CMPIBroker* broker);
    void serveFar(const char* className);

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    RecordingBroker broker_;
    std::map<std::string, Interfaces> interfaces_;
};

// Every operation of a provider, each with every kind of request that takes a way of its own.
// They refer to `providers`.
std::vector<SweptOperation> operationsOf(SweptProviders& providers, const std::string& provider);

// Judges a run in which something failed, as far as all sweeps agree on it: nothing thrown came
// out, the status is a known one, CMReturnDone was called at most once, nothing was misused or
// left over, and at most what a good run delivers was delivered, each result once.
void judgeFaultyRun(SweptProviders& providers, const SweptOperation& operation,
                    const SweptRun& good, const SweptRun& run);

// Whether a run without a fault is as good as the first one.
void expectGoodRun(SweptProviders& providers, const SweptRun& good, const SweptRun& run);

} // namespace qelo::test
