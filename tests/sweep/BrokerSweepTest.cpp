// Every broker call of every operation made to fail, in every way in which a broker can fail.
#include "AnswerText.h"
#include "ExpectedOutcomes.h"
#include "SweepCount.h"
#include "SweptComputerSystem.h"
#include "SweptProviders.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {
namespace {

// How calls fail. The expected outcomes tell all errors by one name: which error it is makes no
// difference other than that some operations pass it on.
struct Way {
    std::string name;
    Fault fault;
    std::string told;
    bool lasting; // tried from each call on, too
};

std::vector<Way> ways() {
    std::vector<Way> all = {
        {"null", Fault::null(), "null", true},
        {"without a handle", Fault::nullHandle(), "no handle", false},
        {"failed", Fault::error(CMPI_RC_ERR_FAILED), "error", false},
        {"denied", Fault::error(CMPI_RC_ERR_ACCESS_DENIED, "broken"), "error", true},
        {"invalid handle", Fault::error(CMPI_RC_ERR_INVALID_HANDLE, "broken"), "error", false}};
    for (int rc = CMPI_RC_ERR_INVALID_NAMESPACE;
         isLongSweep() && rc <= CMPI_RC_ERR_METHOD_NOT_FOUND; ++rc) {
        all.push_back(
            {"status " + std::to_string(rc), Fault::error(static_cast<CMPIrc>(rc)), "error", true});
    }
    for (Way& way : all) {
        way.lasting = way.lasting || isLongSweep();
    }
    return all;
}

const std::vector<std::string> toldWays = {"null", "no handle", "error"};

// The slots that were called, in order.
std::vector<std::string> slotsOf(const std::vector<std::string>& lines) {
    std::vector<std::string> slots;
    slots.reserve(lines.size());
    for (const std::string& line : lines) {
        slots.push_back(line.substr(0, line.find_first_of("( ")));
    }
    return slots;
}

class BrokerSweep : public testing::TestWithParam<const char*> {
protected:
    // The lines of the log are of no interest here, and many.
    BrokerSweep() {
        providers_.platform().setRecording(false);
        providers_.add(sweptComputerSystem, computerSystemInterfaces(broker_.get()));
    }
    ~BrokerSweep() override { computerSystemInterfaces(nullptr); }

    SweptRun runAfresh(const SweptOperation& operation) {
        providers_.restart();
        return providers_.run(operation);
    }

    // The first run, which shows what the operation does where nothing fails.
    SweptRun goodRun(const SweptOperation& operation) {
        broker_.clearFaults();
        const SweptRun good = runAfresh(operation);
        calls_ = numbered(slotsOf(broker_.calls()));
        expected_.good(operation.name, goodText(good, calls_.size()));
        expectGoodRun(providers_, good, runAfresh(operation));
        return good;
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
        for (unsigned int n = 1; n <= calls_.size(); ++n) {
            SCOPED_TRACE(operation.name + ", " + way.name + " at broker call " + std::to_string(n));
            broker_.failCall(n, way.fault);
            const SweptRun run = runFaulty(operation, good);
            expected_.faulty(operation.name, calls_[n - 1], way.told,
                             faultyTexts(run, good, way.fault));
        }
    }

    // A broker that never recovers: every call from the n-th on fails.
    void failAllFrom(const SweptOperation& operation, const SweptRun& good, const Way& way) {
        for (unsigned int n = 1; n <= calls_.size(); ++n) {
            SCOPED_TRACE(operation.name + ", " + way.name + " from broker call " +
                         std::to_string(n) + " on");
            for (unsigned int next = n; next <= calls_.size() + kFurtherCalls; ++next) {
                broker_.failCall(next, way.fault);
            }
            expected_.faultyOften(operation.name,
                                  faultyTexts(runFaulty(operation, good), good, way.fault));
        }
    }

    // Two faults in one run, one after the other; up to kMostApart apart in the long form.
    void failPairs(const SweptOperation& operation, const SweptRun& good, const Way& way) {
        const unsigned int apart = isLongSweep() ? kMostApart : 1;
        SweptOperation robbed = operation; // of the same in two results
        robbed.alike = true;
        for (unsigned int n = 1; n < calls_.size(); ++n) {
            for (unsigned int m = n + 1; m <= calls_.size() && m <= n + apart; ++m) {
                SCOPED_TRACE(operation.name + ", " + way.name + " at broker calls " +
                             std::to_string(n) + " and " + std::to_string(m));
                broker_.failCall(n, way.fault);
                broker_.failCall(m, way.fault);
                expected_.faultyOften(operation.name,
                                      faultyTexts(runFaulty(robbed, good), good, way.fault));
            }
        }
    }

    static constexpr unsigned int kFurtherCalls = 100;
    static constexpr unsigned int kMostApart = 12;

    SweptProviders providers_;
    RecordingBroker& broker_ = providers_.broker();
    std::vector<NthCall> calls_; // of a good run
    ExpectedOutcomes expected_{std::string("broker/") + GetParam(), toldWays};
    std::size_t faults_ = 0;
};

TEST_P(BrokerSweep, Any_broker_call_may_fail_in_any_way) {
    const std::vector<SweptOperation> operations = operationsOf(providers_, GetParam());
    for (const SweptOperation& operation : operations) {
        const SweptRun good = goodRun(operation);
        for (const Way& way : ways()) {
            failEach(operation, good, way);
            if (way.lasting) {
                failAllFrom(operation, good, way);
            }
        }
        failPairs(operation, good, ways().front());
    }
    EXPECT_GT(faults_, operations.size());
    expected_.finish();
    countFaults(std::string("broker, ") + GetParam(), operations.size(), faults_);
}

INSTANTIATE_TEST_SUITE_P(Each, BrokerSweep, testing::ValuesIn(sweptProviders),
                         [](const auto& test) { return std::string(test.param); });
INSTANTIATE_TEST_SUITE_P(Host, BrokerSweep, testing::Values(sweptComputerSystem),
                         [](const auto& test) { return std::string(test.param); });

} // namespace
} // namespace qelo::test
