// The lines that capabilities requests leave in the log and in the trace.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

const Unit& factory = source::capabilitiesFactory;

class CapabilitiesTrace : public CapabilitiesFixture {
protected:
    void expectFactoryLines(const std::string& function, const std::string& params, bool ends) {
        ExpectedTrace expected;
        expected.entering(factory, function, params);
        if (ends) {
            expected.exiting(factory, function, params);
        }
        expectSamePoints(pointsIn(function), expected);
        platform_.forget();
    }

    const std::string pathsCollector_ = "getAllSimAccountManagementCapabilitiesCMPIObjPaths";
    const std::string pathsParams_ = " broker=@ ref=@ objectPaths=@ status=@";
};

TEST_F(CapabilitiesTrace, Collecting_paths_traces_its_parameters) {
    serve({"/a"});
    enumNames();
    expectFactoryLines(pathsCollector_, pathsParams_, true);
}

TEST_F(CapabilitiesTrace, Collecting_no_paths_ends_without_an_exit_line) {
    enumNames();
    expectFactoryLines(pathsCollector_, pathsParams_, false);
}

TEST_F(CapabilitiesTrace, Making_an_instance_traces_its_parameters) {
    serve({"/a"});
    enumInstances();
    expectFactoryLines(
        "makeSimAccountManagementCapabilitiesInstance",
        " broker=@ ref=@ accountManagementCapabilitiesCap=@ properties=0 IsObjPath=0 rc=@", true);
}

TEST_F(CapabilitiesTrace, The_record_itself_is_not_traced) {
    serve({"/a"});
    enumInstances();
    for (const LogLine& line : platform_.lines()) {
        EXPECT_NE(line.file, "SimAccountManagementCapabilities") << line.message;
    }
}

TEST_F(CapabilitiesTrace, Something_thrown_is_traced_under_the_provider_and_ends_the_operation) {
    const Unit provider = source::capabilitiesProvider;
    serve({"/a"});
    platform_.failOperation("getPathToNode", 1, StoreFault::ThrowsForeign);
    const Outcome outcome = enumNames();
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(outcome.hasMessage);
    EXPECT_EQ(broker_.doneCount(), 0);
    expectSamePoints(pointsOf(provider),
                     markers(provider, "SimAccountManagementCapabilities_EnumInstanceNames", false,
                             outcome.message));
}

} // namespace
} // namespace qelo::test
