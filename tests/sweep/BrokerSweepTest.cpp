// Every broker call of every operation made to fail, in every way in which a broker can fail.
#include "SweepCount.h"
#include "SweptProviders.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {
namespace {

struct Way {
    std::string name;
    Fault fault;
};

std::vector<Way> ways() {
    std::vector<Way> all = {{"null", Fault::null()},
                            {"without a handle", Fault::nullHandle()},
                            {"failed", Fault::error(CMPI_RC_ERR_FAILED)},
                            {"denied", Fault::error(CMPI_RC_ERR_ACCESS_DENIED, "broken")},
                            {"invalid handle", Fault::error(CMPI_RC_ERR_INVALID_HANDLE, "broken")}};
    for (int rc = CMPI_RC_ERR_INVALID_NAMESPACE;
         isLongSweep() && rc <= CMPI_RC_ERR_METHOD_NOT_FOUND; ++rc) {
        all.push_back({"status " + std::to_string(rc), Fault::error(static_cast<CMPIrc>(rc))});
    }
    return all;
}

class BrokerSweep : public testing::TestWithParam<const char*> {
protected:
    // The lines of the log are of no interest here, and many.
    BrokerSweep() { providers_.platform().setRecording(false); }

    SweptRun runAfresh(const SweptOperation& operation) {
        providers_.restart();
        return providers_.run(operation);
    }

    // The first run, which shows what the operation does where nothing fails.
    SweptRun goodRun(const SweptOperation& operation) {
        broker_.clearFaults();
        const SweptRun good = runAfresh(operation);
        calls_ = broker_.callCount();
        expectGoodRun(providers_, good, runAfresh(operation));
        return good;
    }

    // An operation that has completed its result and yet reports an error reports the broker's
    // own, of a call whose status is the request's by description, or one of the capabilities'
    // lists that could not be made; it makes up no other. Calling a method completes its result
    // in any case.
    static void expectDoneFits(const SweptOperation& operation, const SweptRun& run,
                               const Way& way) {
        const Outcome& outcome = run.outcome;
        const bool isMethod = operation.name.find("InvokeMethod") == 0;
        const bool isList = outcome.message.find("Creating array for Property") == 0;
        if (run.done != 0 && outcome.rc != CMPI_RC_OK && !isMethod && !isList) {
            EXPECT_TRUE(way.fault.kind == Fault::Kind::Error);
            EXPECT_EQ(outcome.rc, way.fault.rc);
            EXPECT_EQ(outcome.message, way.fault.message);
        }
    }

    // Runs with the faults that are set, then without.
    SweptRun runFaulty(const SweptOperation& operation, const SweptRun& good) {
        ++faults_;
        const SweptRun run = runAfresh(operation);
        EXPECT_TRUE(broker_.faultHit());
        judgeFaultyRun(providers_, operation, good, run);
        broker_.clearFaults();
        expectGoodRun(providers_, good, runAfresh(operation));
        return run;
    }

    void failEach(const SweptOperation& operation, const SweptRun& good, const Way& way) {
        for (unsigned int n = 1; n <= calls_; ++n) {
            SCOPED_TRACE(operation.name + ", " + way.name + " at broker call " + std::to_string(n));
            broker_.failCall(n, way.fault);
            expectDoneFits(operation, runFaulty(operation, good), way);
        }
    }

    // A broker that never recovers: every call from the n-th on fails.
    void failAllFrom(const SweptOperation& operation, const SweptRun& good, const Way& way) {
        for (unsigned int n = 1; n <= calls_; ++n) {
            SCOPED_TRACE(operation.name + ", " + way.name + " from broker call " +
                         std::to_string(n) + " on");
            for (unsigned int next = n; next <= calls_ + kFurtherCalls; ++next) {
                broker_.failCall(next, way.fault);
            }
            runFaulty(operation, good);
        }
    }

    // Two faults in one run, one after the other; up to kMostApart apart in the long form.
    void failPairs(const SweptOperation& operation, const SweptRun& good, const Way& way) {
        const unsigned int apart = isLongSweep() ? kMostApart : 1;
        for (unsigned int n = 1; n < calls_; ++n) {
            for (unsigned int m = n + 1; m <= calls_ && m <= n + apart; ++m) {
                SCOPED_TRACE(operation.name + ", " + way.name + " at broker calls " +
                             std::to_string(n) + " and " + std::to_string(m));
                broker_.failCall(n, way.fault);
                broker_.failCall(m, way.fault);
                runFaulty(operation, good);
            }
        }
    }

    static constexpr unsigned int kFurtherCalls = 100;
    static constexpr unsigned int kMostApart = 12;

    SweptProviders providers_;
    RecordingBroker& broker_ = providers_.broker();
    unsigned int calls_ = 0;
    std::size_t faults_ = 0;
};

TEST_P(BrokerSweep, Any_broker_call_may_fail_in_any_way) {
    const std::vector<SweptOperation> operations = operationsOf(providers_, GetParam());
    for (const SweptOperation& operation : operations) {
        const SweptRun good = goodRun(operation);
        for (const Way& way : ways()) {
            failEach(operation, good, way);
            if (isLongSweep() || way.name == "null" || way.name == "denied") {
                failAllFrom(operation, good, way);
            }
        }
        failPairs(operation, good, ways().front());
    }
    EXPECT_GT(faults_, operations.size());
    countFaults(std::string("broker, ") + GetParam(), operations.size(), faults_);
}

INSTANTIATE_TEST_SUITE_P(Each, BrokerSweep, testing::ValuesIn(sweptProviders),
                         [](const auto& test) { return std::string(test.param); });

} // namespace
} // namespace qelo::test
