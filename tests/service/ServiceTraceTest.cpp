// The lines that service requests leave in the log and in the trace.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

const Unit& factory = source::serviceFactory;

class ServiceTrace : public ServiceFixture {
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

    const std::string pathsCollector_ = "getAllSimAccountManagementServiceCMPIObjPaths";
    const std::string pathsParams_ = " broker=@ ref=@ objectPaths=@ status=@";
};

TEST_F(ServiceTrace, Collecting_paths_traces_its_parameters) {
    serve({"/a"});
    enumNames();
    expectFactoryLines(pathsCollector_, pathsParams_, true);
}

TEST_F(ServiceTrace, Collecting_no_paths_ends_with_an_exit_line) {
    enumNames();
    expectFactoryLines(pathsCollector_, pathsParams_, true);
}

TEST_F(ServiceTrace, A_path_that_cannot_be_made_ends_the_collector_without_an_exit_line) {
    serve({"/a"});
    broker_.failSlot("newObjectPath", 1, Fault::null());
    enumNames();
    expectFactoryLines(pathsCollector_, pathsParams_, false);
}

TEST_F(ServiceTrace, Making_an_instance_traces_its_parameters) {
    serve({"/a"});
    enumInstances();
    expectFactoryLines(
        "makeSimAccountManagementServiceInstance",
        " broker=@ ref=@ simAccountManagementService=@ properties=0 isObjPath=0 rc=@", true);
}

TEST_F(ServiceTrace, Looking_one_up_traces_its_parameters) {
    serve({"/a"});
    getInstance(serviceKeys("/a"));
    expectFactoryLines("getOneSimAccountManagementServiceCMPIInstance",
                       " broker=@ ref=@ key=@ properties=0 instances=@ rc=@", true);
}

TEST_F(ServiceTrace, Something_thrown_is_traced_under_the_provider_and_ends_the_operation) {
    serve({"/a"});
    platform_.failOperation("getPathToNode", 1, StoreFault::ThrowsForeign);
    const Outcome outcome = enumInstances();
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(outcome.hasMessage);
    EXPECT_EQ(broker_.doneCount(), 0);
    expectSamePoints(pointsOf(source::serviceProvider),
                     markers(source::serviceProvider, "SimAccountManagementService_EnumInstances",
                             false, outcome.message));
}

TEST_F(ServiceTrace, Levels_are_3000_4000_and_6000_only) {
    enumNames();
    serve({"/a"});
    enumInstances();
    getInstance(serviceKeys("/a"));
    for (const LogLine& line : platform_.lines()) {
        EXPECT_TRUE(line.level == 3000 || line.level == 4000 || line.level == 6000) << line.level;
    }
}

} // namespace
} // namespace qelo::test
