// Every identity operation while something outside it breaks down.
#include "IdentityFixture.h"

#include "support/allocation/FailingAllocation.h"
#include "support/operations/Sweeps.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

enum class Kind { Names, Instances, Get, GetOfAll };

struct Case {
    const char* name;
    Kind kind;
};

void PrintTo(const Case& test, std::ostream* stream) { *stream << test.name; }

class IdentityFaults : public IdentityFixture, public testing::WithParamInterface<Case> {
protected:
    Outcome runOne() {
        switch (GetParam().kind) {
        case Kind::Names:
            return enumNames();
        case Kind::Instances:
            return enumInstances();
        case Kind::Get:
            return getInstance({{"InstanceID", identifier}});
        case Kind::GetOfAll:
            break;
        }
        return getInstance({{"Name", "other"}});
    }

    // Runs the operation with memory running out while the identity is loaded, which is where
    // standard error is written to. False when no allocation brought that about.
    bool runWithFailedLoad() {
        runOne(); // what is allocated once in a process is there from now on
        for (std::size_t n = 1;; ++n) {
            testing::internal::CaptureStderr();
            FailingAllocation::arm(ProviderLibrary::path(), n);
            outcome_ = runOne();
            const bool hit = FailingAllocation::disarm();
            told_ = testing::internal::GetCapturedStderr();
            if (!told_.empty() || !hit) {
                return hit;
            }
        }
    }

    Outcome outcome_;
    std::string told_;
};

TEST_P(IdentityFaults, The_broker_may_fail_at_any_call) {
    sweepBrokerFaults(broker_, [&] { return runOne(); });
}

TEST_P(IdentityFaults, Memory_may_run_out_at_any_allocation) {
    EXPECT_GT(sweepAllocations(broker_, [&] { return runOne(); }), 1U);
}

TEST_P(IdentityFaults, A_failed_load_is_told_on_standard_error_and_answered_with_nothing) {
    ASSERT_TRUE(runWithFailedLoad());
    EXPECT_EQ(told_, "std::bad_alloc\n");
    expectOk(outcome_);
    expectNothingReturned();
    EXPECT_THAT(messages(), IsEmpty());
    if (GetParam().kind == Kind::Names) {
        EXPECT_THAT(broker_.traces(),
                    ElementsAre(BrokerTrace{2, "SimIdentityProvider", "***No instance found***"}));
        EXPECT_EQ(broker_.doneCount(), 0);
    }
}

INSTANTIATE_TEST_SUITE_P(Operations, IdentityFaults,
                         testing::Values(Case{"EnumInstanceNames", Kind::Names},
                                         Case{"EnumInstances", Kind::Instances},
                                         Case{"GetInstance", Kind::Get},
                                         Case{"GetInstanceOfAll", Kind::GetOfAll}),
                         [](const auto& test) { return test.param.name; });

} // namespace
} // namespace qelo::test
