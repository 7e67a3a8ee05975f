// Every platform call of every operation made to fail: of the store, and of the libraries for
// texts, input and logging.
#include "SweepCount.h"
#include "SweptProviders.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {
namespace {

constexpr StoreFault kWays[] = {StoreFault::ReturnsFalse, StoreFault::ThrowsRuntimeError,
                                StoreFault::ThrowsForeign};

using FailCall = void (RecordingPlatform::*)(std::size_t, StoreFault);
using CountCalls = std::size_t (RecordingPlatform::*)() const;

// One side of the platform: how to make its n-th call fail, and how many there were.
struct Side {
    const char* name;
    FailCall fail;
    CountCalls count;
    // Whether the short form makes each call fail in one way only, a third of them in each.
    // Most calls of the other libraries are lines of the log, many and much alike.
    bool takesTurns;
};

constexpr Side kStore{"store", &RecordingPlatform::failStoreCall,
                      &RecordingPlatform::storeCallCount, false};
constexpr Side kLibraries{"library", &RecordingPlatform::failLibraryCall,
                          &RecordingPlatform::libraryCallCount, true};

class StoreSweep : public testing::TestWithParam<const char*> {
protected:
    SweptRun goodRun(const SweptOperation& operation) {
        providers_.prepareStore();
        const SweptRun good = providers_.run(operation);
        providers_.prepareStore();
        expectGoodRun(providers_, good, providers_.run(operation));
        return good;
    }

    void runFaulty(const SweptOperation& operation, const SweptRun& good) {
        ++faults_;
        judgeFaultyRun(providers_, operation, good, providers_.run(operation));
        providers_.prepareStore();
        expectGoodRun(providers_, good, providers_.run(operation));
    }

    void failCalls(const Side& side, std::size_t first, std::size_t last, StoreFault way) {
        providers_.prepareStore();
        for (std::size_t n = first; n <= last; ++n) {
            (platform_.*side.fail)(n, way);
        }
    }

    // Each call of that side fails alone, then with all that follow it.
    void sweep(const SweptOperation& operation, const SweptRun& good, const Side& side) {
        const std::size_t calls = (platform_.*side.count)();
        const bool takesTurns = side.takesTurns && !isLongSweep();
        for (std::size_t n = 1; n <= calls; ++n) {
            for (std::size_t i = 0; i < std::size(kWays); ++i) {
                if (takesTurns && n % std::size(kWays) != i) {
                    continue;
                }
                SCOPED_TRACE(operation.name + ", way " + std::to_string(i) + " at " + side.name +
                             " call " + std::to_string(n));
                failCalls(side, n, n, kWays[i]);
                runFaulty(operation, good);
                if (!takesTurns || n % kTurns == 0) {
                    failCalls(side, n, calls + kFurtherCalls, kWays[i]);
                    runFaulty(operation, good);
                }
            }
        }
    }

    void sweepAll(const Side& side) {
        const std::vector<SweptOperation> operations = operationsOf(providers_, GetParam());
        for (const SweptOperation& operation : operations) {
            sweep(operation, goodRun(operation), side);
        }
        countFaults(std::string(side.name) + ", " + GetParam(), operations.size(), faults_);
    }

    static constexpr std::size_t kFurtherCalls = 100;
    static constexpr std::size_t kTurns = 10;

    SweptProviders providers_;
    RecordingPlatform& platform_ = providers_.platform();
    std::size_t faults_ = 0;
};

TEST_P(StoreSweep, Any_store_call_may_fail_or_throw) {
    sweepAll(kStore);
    // The identity is a constant: it never asks the store.
    EXPECT_EQ(faults_ > 0, GetParam() != std::string("SimIdentityProvider"));
}

TEST_P(StoreSweep, Any_call_of_another_library_may_fail_or_throw) {
    sweepAll(kLibraries);
    EXPECT_GT(faults_, 0U);
}

INSTANTIATE_TEST_SUITE_P(Each, StoreSweep, testing::ValuesIn(sweptProviders),
                         [](const auto& test) { return std::string(test.param); });

} // namespace
} // namespace qelo::test
