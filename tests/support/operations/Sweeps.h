// What every operation must stand: something outside it fails at the first call, at the
// second, and so on over all of them. After each such run nothing was misused, no cursor and
// no clone is left, and at most the results of a good run were delivered, none of them twice.
#pragma once

#include "support/broker/RecordingBroker.h"
#include "support/platform/RecordingPlatform.h"

#include <cstddef>
#include <functional>

namespace qelo::test {

using Operation = std::function<Outcome()>;

// What an operation may deliver when something fails.
struct Delivery {
    // Results at most; 0 is as many as a good run delivers.
    std::size_t most = 0;
    // Whether two results of one run can be told from each other.
    bool distinct = true;
};

// Fails each broker call in turn. Returns how many calls a good run makes.
unsigned int sweepBrokerCalls(RecordingBroker& broker, const Fault& fault,
                              const Operation& operation, const Delivery& delivery = {});

// The same for every kind of fault, of which there are three.
void sweepBrokerFaults(RecordingBroker& broker, const Operation& operation,
                       const Delivery& delivery = {});

// Fails each store call in turn, with a store that `prepare` sets up afresh each time. Returns
// how many calls a good run makes.
std::size_t sweepStoreCalls(RecordingBroker& broker, StoreFault fault,
                            const std::function<void()>& prepare, const Operation& operation,
                            const Delivery& delivery = {});

// Fails each allocation of the provider library in turn. The operation then either succeeds or
// fails with a status; the run after it is as good as the first. Returns how many allocations a
// good run makes.
std::size_t sweepAllocations(RecordingBroker& broker, const Operation& operation,
                             const Delivery& delivery = {});

} // namespace qelo::test
