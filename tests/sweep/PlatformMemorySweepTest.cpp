// Every allocation of the stand-alone platform made to fail, in every operation.
#include "SweepCount.h"
#include "SweptLibrary.h"
#include "SweptStore.h"

#include "platform/commands/CommandTest.h"
#include "support/allocation/FailingAllocation.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>
#include <tuple>

namespace qelo::test {
namespace {

using Kind = SweptStore::Kind;

class PlatformMemorySweep : public testing::TestWithParam<std::tuple<Kind, const char*>> {
protected:
    PlatformMemorySweep() {
        write(scratch_.path() / "logging.conf", "log = none\nlog.level = off\n");
        ::setenv("QELO_LOG_CONFIG", (scratch_.path() / "logging.conf").c_str(), 1);
        FailingAllocation::countBlocks(true);
    }
    ~PlatformMemorySweep() override { FailingAllocation::countBlocks(false); }

    // Runs with the n-th allocation failing, none for 0. Blocks are counted on afterwards.
    SweptRun runArmed(const SweptOperation& operation, std::size_t n) {
        SweptOperation armed = operation;
        armed.call = [&](auto context, auto result) {
            FailingAllocation::arm(libraries_, n);
            const auto harmless = [&](const void*) {
                hit_ = FailingAllocation::stopFailing();
                reached_ = FailingAllocation::reached();
            };
            const std::unique_ptr<const void, decltype(harmless)> atEnd(&n, harmless);
            return operation.call(context, result);
        };
        return library_.run(armed);
    }

    // The blocks that the platform keeps for nothing.
    static std::size_t blocksLeft() {
        SweptStore::forget();
        FailingAllocation::disarm();
        return FailingAllocation::blocksLeft();
    }

    // What is built once in the life of the libraries is there after the first run.
    SweptRun goodRun(const SweptOperation& operation) {
        store_.choose();
        const SweptRun good = library_.run(operation);
        SweptStore::forget();
        store_.choose();
        expectGoodRun(library_, good, runArmed(operation, 0));
        EXPECT_FALSE(hit_);
        blocksKept_ = blocksLeft();
        return good;
    }

    void judge(const SweptOperation& operation, const SweptRun& good, const SweptRun& run) {
        judgeFaultyRun(library_, operation, good, run);
        EXPECT_TRUE(run.outcome.rc == good.outcome.rc || run.outcome.rc == CMPI_RC_ERR_FAILED)
            << run.outcome.rc;
        // Whoever is told that all is well has got everything, or, as from a store that cannot
        // be read, nothing; never a part.
        if (run.outcome.rc == CMPI_RC_OK && !run.delivered.empty()) {
            EXPECT_EQ(run.delivered, good.delivered);
        }
    }

    // The short form leaves allocations out, each operation others.
    void sweep(const SweptOperation& operation, std::size_t number) {
        const SweptRun good = goodRun(operation);
        const std::size_t last = reached_;
        const std::size_t step = isLongSweep() ? 1 : kStep;
        for (std::size_t n = 1 + number % step; n <= last; n += step) {
            SCOPED_TRACE(operation.name + ", allocation " + std::to_string(n) + " of " +
                         std::to_string(last));
            store_.choose();
            const SweptRun run = runArmed(operation, n);
            EXPECT_TRUE(hit_);
            ++faults_;
            judge(operation, good, run);
            expectGoodRun(library_, good, library_.run(operation));
            EXPECT_EQ(blocksLeft(), blocksKept_);
        }
    }

    static constexpr std::size_t kStep = 37;

    ScratchDirectory scratch_;
    const std::vector<std::string> libraries_ = platformLibraries();
    SweptLibrary library_;
    SweptStore store_{std::get<Kind>(GetParam()), scratch_.path()};
    std::size_t blocksKept_ = 0;
    std::size_t faults_ = 0;
    std::size_t reached_ = 0;
    bool hit_ = false;
};

std::string nameOf(const testing::TestParamInfo<std::tuple<Kind, const char*>>& test) {
    return testing::PrintToString(std::get<Kind>(test.param)) + std::get<const char*>(test.param);
}

TEST_P(PlatformMemorySweep, Memory_may_run_out_at_any_allocation_of_the_platform) {
    const std::vector<SweptOperation> operations =
        operationsOf(library_, std::get<const char*>(GetParam()));
    std::size_t number = 0;
    for (const SweptOperation& operation : operations) {
        sweep(operation, number++);
    }
    // The one identity is made without a look at the platform.
    const bool asks = std::get<const char*>(GetParam()) != std::string("SimIdentityProvider");
    EXPECT_EQ(faults_ != 0, asks);
    countFaults("platform memory, " + nameOf({GetParam(), 0}), operations.size(), faults_);
}

INSTANTIATE_TEST_SUITE_P(Each, PlatformMemorySweep,
                         testing::Combine(testing::Values(Kind::Accounts, Kind::NodeFile),
                                          testing::ValuesIn(sweptProviders)),
                         nameOf);

} // namespace
} // namespace qelo::test
