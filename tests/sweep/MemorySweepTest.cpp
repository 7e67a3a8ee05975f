// Every allocation of every operation made to fail.
#include "SweepCount.h"
#include "SweptProviders.h"

#include "support/allocation/FailingAllocation.h"
#include "support/platform/ProviderLibrary.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>

namespace qelo::test {
namespace {

class MemorySweep : public testing::TestWithParam<const char*> {
protected:
    MemorySweep() { FailingAllocation::countBlocks(true); }
    ~MemorySweep() override { FailingAllocation::countBlocks(false); }

    // Runs with the n-th allocation failing, none for 0. Whatever the provider library has
    // allocated by its end must be freed.
    SweptRun runArmed(const SweptOperation& operation, std::size_t n) {
        providers_.restart();
        SweptRun run;
        SweptOperation armed = operation;
        armed.call = [&](auto context, auto result) {
            FailingAllocation::arm(library_, n);
            const auto disarmed = [&](const void*) { hit_ = FailingAllocation::disarm(); };
            const std::unique_ptr<const void, decltype(disarmed)> atEnd(&n, disarmed);
            return operation.call(context, result);
        };
        run = providers_.run(armed);
        EXPECT_EQ(FailingAllocation::blocksLeft(), 0U);
        return run;
    }

    SweptRun goodRun(const SweptOperation& operation) {
        // What is built once in the life of the library is not counted as left over.
        providers_.restart();
        const SweptRun good = providers_.run(operation);
        expectGoodRun(providers_, good, runArmed(operation, 0));
        EXPECT_FALSE(hit_);
        return good;
    }

    void sweep(const SweptOperation& operation) {
        const SweptRun good = goodRun(operation);
        for (std::size_t n = 1;; ++n) {
            SCOPED_TRACE(operation.name + ", allocation " + std::to_string(n));
            const SweptRun run = runArmed(operation, n);
            if (!hit_) {
                expectGoodRun(providers_, good, run);
                return;
            }
            ++faults_;
            EXPECT_TRUE(run.outcome.rc == good.outcome.rc || run.outcome.rc == CMPI_RC_ERR_FAILED)
                << run.outcome.rc;
            judgeFaultyRun(providers_, operation, good, run);
            providers_.restart();
            expectGoodRun(providers_, good, providers_.run(operation));
        }
    }

    const std::string library_ = ProviderLibrary::path();
    SweptProviders providers_;
    std::size_t faults_ = 0;
    bool hit_ = false;
};

TEST_P(MemorySweep, Memory_may_run_out_at_any_allocation) {
    const std::vector<SweptOperation> operations = operationsOf(providers_, GetParam());
    for (const SweptOperation& operation : operations) {
        sweep(operation);
    }
    EXPECT_GT(faults_, operations.size());
    countFaults(std::string("memory, ") + GetParam(), operations.size(), faults_);
}

INSTANTIATE_TEST_SUITE_P(Each, MemorySweep, testing::ValuesIn(sweptProviders),
                         [](const auto& test) { return std::string(test.param); });

} // namespace
} // namespace qelo::test
