// Every platform call of every operation made to fail: of the store, and of the libraries for
// texts, input and logging.
#include "AnswerText.h"
#include "ExpectedOutcomes.h"
#include "SweepCount.h"
#include "SweptProviders.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {
namespace {

struct Way {
    const char* told;
    StoreFault fault;
    const char* text; // in which an operation tells of it
};

constexpr Way kWays[] = {
    {"false", StoreFault::ReturnsFalse, ""},
    {"throws", StoreFault::ThrowsRuntimeError, storeFailureText},
    {"throws foreign", StoreFault::ThrowsForeign, "unknown exception"},
};

const std::vector<std::string> toldWays = {"false", "throws", "throws foreign"};

// The calls of the store, in order; the end of a cursor is none.
std::vector<std::string> callsOf(const std::vector<StoreCall>& calls) {
    std::vector<std::string> operations;
    for (const StoreCall& call : calls) {
        if (call.operation.front() != '~') {
            operations.push_back(call.operation);
        }
    }
    return operations;
}

// "FAILED with its text" where the operation tells of what was thrown.
std::string withItsText(std::string outcome, const Way& way) {
    const std::string text = "\"" + std::string(way.text) + "\"";
    const std::size_t at = outcome.find(text);
    return at == std::string::npos ? outcome : outcome.replace(at, text.size(), "with its text");
}

using FailCall = void (RecordingPlatform::*)(std::size_t, StoreFault);
using CountCalls = std::size_t (RecordingPlatform::*)() const;

// One side of the platform: how to make its n-th call fail, and how many there were.
struct Side {
    const char* name;
    FailCall fail;
    CountCalls count;
    // Whether its calls are many and much alike, as those of the other libraries, of which most
    // are lines of the log. They are not told apart then, and the short form makes each call fail
    // in one way only, a third of them in each.
    bool alike;
};

constexpr Side kStore{"store", &RecordingPlatform::failStoreCall,
                      &RecordingPlatform::storeCallCount, false};
constexpr Side kLibraries{"library", &RecordingPlatform::failLibraryCall,
                          &RecordingPlatform::libraryCallCount, true};

class StoreSweep : public testing::TestWithParam<const char*> {
protected:
    static bool isComplete() { return isLongSweep() || writesExpectations(); }

    SweptRun goodRun(const SweptOperation& operation, const Side& side) {
        providers_.prepareStore();
        const SweptRun good = providers_.run(operation);
        const std::size_t count = (platform_.*side.count)();
        calls_ = numbered(side.alike ? std::vector<std::string>(count, side.name)
                                     : callsOf(platform_.storeCalls()));
        EXPECT_EQ(calls_.size(), count);
        providers_.prepareStore();
        expectGoodRun(providers_, good, providers_.run(operation));
        return good;
    }

    std::string runFaulty(const SweptOperation& operation, const SweptRun& good, const Way& way) {
        ++faults_;
        const SweptRun run = providers_.run(operation);
        judgeFaultyRun(providers_, operation, good, run);
        providers_.prepareStore();
        expectGoodRun(providers_, good, providers_.run(operation));
        return withItsText(faultyText(run, good), way);
    }

    void failCalls(const Side& side, std::size_t first, std::size_t last, StoreFault way) {
        providers_.prepareStore();
        for (std::size_t n = first; n <= last; ++n) {
            (platform_.*side.fail)(n, way);
        }
    }

    // Each call of that side fails alone, then with all that follow it.
    void sweep(const SweptOperation& operation, const SweptRun& good, const Side& side,
               ExpectedOutcomes& expected) {
        const std::size_t calls = calls_.size();
        const bool takesTurns = side.alike && !isComplete();
        for (std::size_t n = 1; n <= calls; ++n) {
            for (std::size_t i = 0; i < std::size(kWays); ++i) {
                if (takesTurns && n % std::size(kWays) != i) {
                    continue;
                }
                const Way& way = kWays[i];
                SCOPED_TRACE(operation.name + ", " + way.told + " at " + side.name + " call " +
                             std::to_string(n));
                failCalls(side, n, n, way.fault);
                const std::string text = runFaulty(operation, good, way);
                if (side.alike) {
                    expected.faultySomewhere(operation.name, way.told, text);
                } else {
                    expected.faulty(operation.name, calls_[n - 1], way.told, {text});
                }
                if (!takesTurns || n % kTurns == 0) {
                    failCalls(side, n, calls + kFurtherCalls, way.fault);
                    expected.faultyOften(operation.name, {runFaulty(operation, good, way)});
                }
            }
        }
    }

    void sweepAll(const Side& side) {
        ExpectedOutcomes expected(side.name + ("/" + std::string(GetParam())), toldWays);
        const std::vector<SweptOperation> operations = operationsOf(providers_, GetParam());
        for (const SweptOperation& operation : operations) {
            const SweptRun good = goodRun(operation, side);
            expected.good(operation.name, goodText(good, calls_.size(), !side.alike));
            sweep(operation, good, side, expected);
        }
        expected.finish(!side.alike || isComplete());
        countFaults(std::string(side.name) + ", " + GetParam(), operations.size(), faults_);
    }

    static constexpr std::size_t kFurtherCalls = 100;
    static constexpr std::size_t kTurns = 10;

    SweptProviders providers_;
    RecordingPlatform& platform_ = providers_.platform();
    std::vector<NthCall> calls_; // of a good run
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
