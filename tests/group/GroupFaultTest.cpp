// Every group operation while something outside it breaks down.
#include "GroupFixture.h"

#include "support/operations/Sweeps.h"

namespace qelo::test {
namespace {

struct Case {
    const char* name;
    bool method = false;
    std::vector<NamedValue> keys = {};
    bool names = false;
};

void PrintTo(const Case& test, std::ostream* stream) { *stream << test.name; }

// Too long to be kept without an allocation.
const std::string longName = "a group with quite a long name";

class GroupFaults : public GroupFixture, public testing::WithParamInterface<Case> {
protected:
    void prepare() {
        serve({groupNode(longName, {"root", "eve"}), groupNode("adm")});
        platform_.setEntryCount(Tesk::NodeLexicon::UserGroup, 9);
    }

    Outcome runOne() {
        const Case& test = GetParam();
        if (test.method) {
            return invoke(longName.c_str(), arguments_);
        }
        if (test.names) {
            return enumNames();
        }
        return test.keys.empty() ? enumInstances() : getInstance(test.keys);
    }

    const CMPIArgs* arguments_ = broker_.makeArgs()
                                     .string("S", longName)
                                     .uint32("N", 1)
                                     .dateTime("D", "20140307123005.000000+000");
};

TEST_P(GroupFaults, The_broker_may_fail_at_any_call) {
    prepare();
    // A key that cannot be read counts as missing, and then every group is returned.
    sweepBrokerFaults(broker_, [&] { return runOne(); }, {2});
}

TEST_P(GroupFaults, The_store_may_fail_at_any_call) {
    for (const StoreFault fault :
         {StoreFault::ReturnsFalse, StoreFault::ThrowsRuntimeError, StoreFault::ThrowsForeign}) {
        EXPECT_GT(sweepStoreCalls(
                      broker_, fault, [&] { prepare(); }, [&] { return runOne(); }),
                  1U);
    }
}

TEST_P(GroupFaults, Memory_may_run_out_at_any_allocation) {
    prepare();
    EXPECT_GT(sweepAllocations(broker_, [&] { return runOne(); }), 1U);
}

INSTANTIATE_TEST_SUITE_P(
    Operations, GroupFaults,
    testing::Values(Case{"EnumInstanceNames", false, {}, true}, Case{"EnumInstances"},
                    Case{"GetInstance", false, groupKeys(longName)},
                    Case{"GetInstanceOfAll", false, {{"CreationClassName", "ZANTH_Group"}}},
                    Case{"InvokeMethod", true}),
    [](const auto& test) { return test.param.name; });

} // namespace
} // namespace qelo::test
