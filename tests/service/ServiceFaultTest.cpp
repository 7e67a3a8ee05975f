// Every operation of service and capabilities while something outside it breaks down.
#include "ServiceFixture.h"

#include "support/operations/Sweeps.h"

namespace qelo::test {
namespace {

enum class Kind { Names, Instances, Get, GetByPath };

struct Case {
    const char* name;
    Kind kind;
};

void PrintTo(const Case& test, std::ostream* stream) { *stream << test.name; }

template <class Fixture> class Faults : public Fixture, public testing::WithParamInterface<Case> {
protected:
    void prepare() {
        this->serve({"/b", "/a"});
        // Also where the broker answers nothing, so that the comparison is reached.
        this->platform_.setPathAnswers({true});
    }

    Outcome runOne(const NamedValue& key) {
        // The answers to comparisons count from here.
        this->platform_.forget();
        return runKeeping(key);
    }

    void sweepBroker(const NamedValue& key) {
        prepare();
        sweepBrokerFaults(this->broker_, [&] { return runOne(key); });
    }
    void sweepStore(const NamedValue& key) {
        for (const StoreFault fault : {StoreFault::ReturnsFalse, StoreFault::ThrowsRuntimeError,
                                       StoreFault::ThrowsForeign}) {
            // What is recorded is kept, since forgetting it would restart the count of calls.
            EXPECT_GT(
                sweepStoreCalls(
                    this->broker_, fault, [&] { prepare(); }, [&] { return runKeeping(key); }),
                1U);
        }
    }
    void sweepMemory(const NamedValue& key) {
        prepare();
        EXPECT_GT(sweepAllocations(this->broker_, [&] { return runOne(key); }), 1U);
    }

private:
    Outcome runKeeping(const NamedValue& key) {
        switch (GetParam().kind) {
        case Kind::Names:
            return this->enumNames();
        case Kind::Instances:
            return this->enumInstances();
        case Kind::Get:
            return this->getInstance({key});
        case Kind::GetByPath:
            break;
        }
        return this->getInstance({{"SystemName", "host.example"}});
    }
};

class ServiceFaults : public Faults<ServiceFixture> {
protected:
    const NamedValue key_{"Name", serviceName("/b")};
};

class CapabilitiesFaults : public Faults<CapabilitiesFixture> {
protected:
    const NamedValue key_{"InstanceID", capabilitiesId("/b")};
};

TEST_P(ServiceFaults, The_broker_may_fail_at_any_call) { sweepBroker(key_); }
TEST_P(ServiceFaults, The_store_may_fail_at_any_call) { sweepStore(key_); }
TEST_P(ServiceFaults, Memory_may_run_out_at_any_allocation) { sweepMemory(key_); }

TEST_P(CapabilitiesFaults, The_broker_may_fail_at_any_call) { sweepBroker(key_); }
TEST_P(CapabilitiesFaults, The_store_may_fail_at_any_call) { sweepStore(key_); }
TEST_P(CapabilitiesFaults, Memory_may_run_out_at_any_allocation) { sweepMemory(key_); }

const auto cases =
    testing::Values(Case{"EnumInstanceNames", Kind::Names}, Case{"EnumInstances", Kind::Instances},
                    Case{"GetInstance", Kind::Get}, Case{"GetInstanceByPath", Kind::GetByPath});
const auto caseName = [](const auto& test) { return test.param.name; };

INSTANTIATE_TEST_SUITE_P(Operations, ServiceFaults, cases, caseName);
INSTANTIATE_TEST_SUITE_P(Operations, CapabilitiesFaults, cases, caseName);

} // namespace
} // namespace qelo::test
