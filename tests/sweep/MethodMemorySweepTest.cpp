// Every allocation of the stand-alone platform made to fail, in every method that changes the
// account database.
#include "MethodWorld.h"
#include "SweepCount.h"
#include "SweptLibrary.h"
#include "SweptStore.h"

#include "support/allocation/FailingAllocation.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <memory>

namespace qelo::test {
namespace {

using testing::IsEmpty;

// The arguments of a call, from NAME:TYPE:VALUE each.
CMPIArgs* makeArguments(RecordingBroker& broker, const std::vector<std::string>& lines) {
    ArgsBuilder args = broker.makeArgs();
    for (const std::string& line : lines) {
        const std::size_t first = line.find(':');
        const std::size_t second = line.find(':', first + 1);
        const std::string name = line.substr(0, first);
        const std::string type = line.substr(first + 1, second - first - 1);
        const std::string value = line.substr(second + 1);
        if (type == "CMPI_uint32") {
            args.uint32(name, static_cast<CMPIUint32>(std::stoul(value)));
        } else if (type == "CMPI_dateTime") {
            args.dateTime(name, value);
        } else {
            args.string(name, value);
        }
    }
    return args;
}

std::size_t openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd");
    return static_cast<std::size_t>(std::distance(begin(all), end(all)));
}

class MethodMemorySweep : public testing::TestWithParam<SweptMethod> {
protected:
    MethodMemorySweep() {
        write(scratch_.path() / "logging.conf", "log = none\nlog.level = off\n");
        ::setenv("QELO_LOG_CONFIG", (scratch_.path() / "logging.conf").c_str(), 1);
    }

    SweptOperation method(const SweptMethod& swept) {
        const bool group = swept.method.find("User") == std::string::npos &&
                           swept.method.find("Password") == std::string::npos;
        CMPIMethodMI* const mi =
            library_.interfaces(group ? "SimGroupProvider" : "SimAccountProvider").methods;
        const CMPIObjectPath* const ref =
            library_.broker().makePath("root/cimv2", group ? "ZANTH_Group" : "ZANTH_Account");
        const CMPIArgs* const in = makeArguments(library_.broker(), swept.arguments);
        CMPIArgs* const out = library_.broker().makeArgs();
        return {swept.name, [=](auto context, auto result) {
                    return mi->ft->invokeMethod(mi, context, result, ref, swept.method.c_str(), in,
                                                out);
                }};
    }

    // Runs with the n-th allocation failing, none for 0. The platform has read the store before:
    // what happens when it cannot is no matter of the methods.
    SweptRun runArmed(const SweptOperation& operation, std::size_t n) {
        SweptStore::makeKnown(world_.root());
        SweptOperation armed = operation;
        armed.call = [&](auto context, auto result) {
            FailingAllocation::arm(libraries_, n);
            const auto disarmed = [&](const void*) {
                hit_ = FailingAllocation::disarm();
                reached_ = FailingAllocation::reached();
            };
            const std::unique_ptr<const void, decltype(disarmed)> atEnd(&n, disarmed);
            return operation.call(context, result);
        };
        return library_.run(armed);
    }

    // Whoever is told that it is done finds it done; otherwise nothing has changed.
    void judge(const SweptOperation& operation, const SweptRun& good, const SweptRun& run) {
        judgeFaultyRun(library_, operation, good, run);
        EXPECT_EQ(openDescriptors(), descriptors_);
        EXPECT_TRUE(world_.isUnlocked());
        EXPECT_THAT(findFaults(world_.root()), IsEmpty());
        const bool done = run.outcome.rc == CMPI_RC_OK;
        EXPECT_TRUE(done || run.outcome.rc == CMPI_RC_ERR_FAILED) << run.outcome.rc;
        const MethodWorld::State now = world_.state();
        EXPECT_EQ(done ? MethodWorld::withoutRests(now) : now,
                  done ? world_.after() : world_.before());
        if (now != world_.before()) {
            world_.renew();
        }
    }

    // The next call finds nothing in its way.
    void expectNextRun(const SweptOperation& operation, const SweptRun& good) {
        expectGoodRun(library_, good, runArmed(operation, 0));
        EXPECT_EQ(world_.state(), world_.after());
        EXPECT_THAT(findFaults(world_.root()), IsEmpty());
        world_.renew();
    }

    // The short form leaves allocations out, each method others; but none of the last ones, when
    // the method is done and has only to say so.
    static std::size_t firstFailing() {
        return isLongSweep() ? 1 : 1 + GetParam().name.size() % kStep;
    }
    static std::size_t nextFailing(std::size_t n, std::size_t last) {
        const std::size_t end = last - kEnd;
        return isLongSweep() || n >= end ? n + 1 : std::min(n + kStep, end);
    }

    static constexpr std::size_t kStep = 23;
    static constexpr std::size_t kEnd = 8;
    static constexpr std::size_t kNextEvery = 8;

    const ScratchDirectory scratch_;
    const std::vector<std::string> libraries_ = platformLibraries();
    SweptLibrary library_;
    MethodWorld world_{GetParam()};
    std::size_t descriptors_ = 0;
    std::size_t reached_ = 0;
    bool hit_ = false;
};

TEST_P(MethodMemorySweep, Memory_may_run_out_at_any_allocation_and_leaves_the_old_or_new_state) {
    const SweptOperation operation = method(GetParam());
    const SweptRun good = runArmed(operation, 0);
    EXPECT_EQ(good.outcome.rc, CMPI_RC_OK) << good.outcome.message;
    EXPECT_EQ(world_.state(), world_.after());
    world_.renew();
    descriptors_ = openDescriptors();
    const std::size_t last = reached_;
    ASSERT_GT(last, kEnd);
    std::size_t faults = 0;
    for (std::size_t n = firstFailing(); n <= last; n = nextFailing(n, last)) {
        SCOPED_TRACE("allocation " + std::to_string(n) + " of " + std::to_string(last));
        const SweptRun run = runArmed(operation, n);
        EXPECT_TRUE(hit_);
        judge(operation, good, run);
        if (++faults % kNextEvery == 0) {
            expectNextRun(operation, good);
        }
    }
    EXPECT_GT(faults, kEnd);
    countFaults("platform memory, " + GetParam().name, 1, faults);
}

INSTANTIATE_TEST_SUITE_P(Each, MethodMemorySweep, testing::ValuesIn(sweptMethods()),
                         [](const auto& test) { return test.param.name; });

} // namespace
} // namespace qelo::test
