#include "Sweeps.h"

#include "support/allocation/FailingAllocation.h"
#include "support/platform/ProviderLibrary.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

namespace qelo::test {

namespace {

std::vector<std::string> delivered(const RecordingBroker& broker) {
    std::vector<std::string> texts;
    for (const Path& path : broker.returnedPaths()) {
        texts.push_back(path.toString());
    }
    for (const Instance& instance : broker.returnedInstances()) {
        texts.push_back(instance.toString());
    }
    for (const Value& value : broker.returnedData()) {
        texts.push_back(value.describe());
    }
    return texts;
}

// Runs the operation without a fault; with a fault it may deliver what results.
Delivery afterGoodRun(RecordingBroker& broker, const Operation& operation,
                      const Delivery& delivery) {
    operation();
    EXPECT_THAT(broker.violations(), testing::IsEmpty());
    EXPECT_LE(broker.doneCount(), 1);
    return {delivery.most != 0 ? delivery.most : delivered(broker).size(), delivery.distinct};
}

// Judges a run in which something failed.
void judge(RecordingBroker& broker, const Delivery& delivery) {
    const std::vector<std::string> texts = delivered(broker);
    EXPECT_LE(texts.size(), delivery.most);
    if (delivery.distinct) {
        EXPECT_EQ(std::set<std::string>(texts.begin(), texts.end()).size(), texts.size());
    }
    EXPECT_LE(broker.doneCount(), 1);
    EXPECT_THAT(broker.violations(), testing::IsEmpty());
    EXPECT_EQ(broker.liveClones(), 0U);
    EXPECT_EQ(RecordingPlatform::instance().openCursors(), 0U);
    broker.clearViolations();
}

} // namespace

unsigned int sweepBrokerCalls(RecordingBroker& broker, const Fault& fault,
                              const Operation& operation, const Delivery& delivery) {
    broker.clearFaults();
    const Delivery allowed = afterGoodRun(broker, operation, delivery);
    const unsigned int calls = broker.callCount();
    for (unsigned int n = 1; n <= calls; ++n) {
        SCOPED_TRACE("fault at broker call " + std::to_string(n));
        broker.clearFaults();
        broker.failCall(n, fault);
        EXPECT_NO_THROW(operation());
        EXPECT_TRUE(broker.faultHit());
        judge(broker, allowed);
    }
    broker.clearFaults();
    return calls;
}

void sweepBrokerFaults(RecordingBroker& broker, const Operation& operation,
                       const Delivery& delivery) {
    EXPECT_GT(sweepBrokerCalls(broker, Fault::null(), operation, delivery), 1U);
    EXPECT_GT(sweepBrokerCalls(broker, Fault::nullHandle(), operation, delivery), 1U);
    EXPECT_GT(sweepBrokerCalls(broker, Fault::error(CMPI_RC_ERR_ACCESS_DENIED, "broken"), operation,
                               delivery),
              1U);
}

std::size_t sweepStoreCalls(RecordingBroker& broker, StoreFault fault,
                            const std::function<void()>& prepare, const Operation& operation,
                            const Delivery& delivery) {
    RecordingPlatform& platform = RecordingPlatform::instance();
    platform.reset();
    prepare();
    const Delivery allowed = afterGoodRun(broker, operation, delivery);
    const std::size_t calls = platform.storeCallCount();
    for (std::size_t n = 1; n <= calls; ++n) {
        SCOPED_TRACE("fault at store call " + std::to_string(n));
        platform.reset();
        prepare();
        platform.failStoreCall(n, fault);
        EXPECT_NO_THROW(operation());
        judge(broker, allowed);
    }
    return calls;
}

std::size_t sweepAllocations(RecordingBroker& broker, const Operation& operation,
                             const Delivery& delivery) {
    const Delivery allowed = afterGoodRun(broker, operation, delivery);
    const std::vector<std::string> good = delivered(broker);
    for (std::size_t n = 1;; ++n) {
        SCOPED_TRACE("fault at allocation " + std::to_string(n));
        FailingAllocation::arm(ProviderLibrary::path(), n);
        Outcome outcome;
        EXPECT_NO_THROW(outcome = operation());
        if (!FailingAllocation::disarm()) {
            EXPECT_EQ(delivered(broker), good);
            return n - 1;
        }
        EXPECT_TRUE(outcome.rc == CMPI_RC_OK || outcome.rc == CMPI_RC_ERR_FAILED) << outcome.rc;
        judge(broker, allowed);
        operation();
        EXPECT_EQ(delivered(broker), good);
    }
}

} // namespace qelo::test
