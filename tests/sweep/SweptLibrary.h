// The seven providers behind the library's eleven factory functions, behind a broker that can
// be made to fail, on whatever platform the program has.
#pragma once

#include "support/broker/RecordingBroker.h"

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
    bool oneTwice = false;              // the same object was delivered more than once
    std::vector<std::string> madeTwice; // looked at where results cannot be told by their texts
};

struct SweptOperation {
    std::string name;
    std::function<CMPIStatus(const CMPIContext*, const CMPIResult*)> call;
    // Results at most when something fails; 0 is as many as a good run delivers.
    std::size_t most = 0;
    // Whether two results of one run can be told from each other by their texts.
    bool distinct = true;
    // Whether two results may even be made alike, as where several faults take the same from each.
    bool alike = false;
};

class SweptLibrary {
public:
    SweptLibrary();
    ~SweptLibrary();
    SweptLibrary(const SweptLibrary&) = delete;
    SweptLibrary& operator=(const SweptLibrary&) = delete;

    // One more provider, of another library.
    void add(const std::string& provider, const Interfaces& interfaces) {
        interfaces_[provider] = interfaces;
    }

    SweptRun run(const SweptOperation& operation);

    RecordingBroker& broker() { return broker_; }
    const Interfaces& interfaces(const std::string& provider) const {
        return interfaces_.at(provider);
    }

private:
    void registerAll(const CMPIBroker* broker);
    void serveFar(const char* className);

    RecordingBroker broker_;
    std::map<std::string, Interfaces> interfaces_;
};

// Every operation of a provider, each with every kind of request that takes a way of its own.
// They refer to `library`. Looked up are instances of a store that holds an account and a group
// with quite long names, and services.
std::vector<SweptOperation> operationsOf(SweptLibrary& library, const std::string& provider);

// Judges a run in which something failed, as far as all sweeps agree on it: nothing thrown came
// out, the status is a known one, CMReturnDone was called at most once, nothing was misused or
// left over, and at most what a good run delivers was delivered, each result once.
void judgeFaultyRun(SweptLibrary& library, const SweptOperation& operation, const SweptRun& good,
                    const SweptRun& run);

// Whether a run without a fault is as good as the first one.
void expectGoodRun(SweptLibrary& library, const SweptRun& good, const SweptRun& run);

} // namespace qelo::test
