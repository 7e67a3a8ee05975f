// The lines that identity requests leave in the log and in the trace.
#include "IdentityFixture.h"

#include <sstream>

namespace qelo::test {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;

const Unit& provider = source::identityProvider;
const Unit& factory = source::identityFactory;

class IdentityTrace : public IdentityFixture {
protected:
    // That the provider's own lines are an entry, and an exit where it comes to its end.
    void expectLines(const std::string& function, const std::string& params, bool ends = true) {
        ExpectedTrace expected;
        expected.entering(provider, function, params);
        if (ends) {
            expected.exiting(provider, function, params);
        }
        expectSamePoints(pointsOf(provider), expected);
        platform_.forget();
    }

    void expectFactoryLines(const std::string& function, const std::string& params, bool ends) {
        ExpectedTrace expected;
        expected.entering(factory, function, params);
        if (ends) {
            expected.exiting(factory, function, params);
        }
        expectSamePoints(pointsIn(function), expected);
        platform_.forget();
    }
};

const std::string enumNamesParams = " mi=@ ctx=@ result=@ ref=@";
const std::string getParams = " mi=@ ctx=@ result=@ cop=@ properties=0";

TEST_F(IdentityTrace, Operations_trace_entry_and_exit_with_their_parameters) {
    enumNames();
    expectLines("SimIdentity_EnumInstanceNames", enumNamesParams);
    enumInstances();
    expectLines("SimIdentity_EnumInstances", enumNamesParams + " properties=0");
    enumInstances({{"ElementName"}});
    expectLines("SimIdentity_EnumInstances", enumNamesParams + " properties=@");
    getInstance({{"InstanceID", identifier}});
    expectLines("SimIdentity_GetInstance", getParams);
    getInstance({{"Name", "other"}});
    expectLines("SimIdentity_GetInstance", getParams);
}

TEST_F(IdentityTrace, The_parameters_are_the_addresses_of_the_arguments) {
    enumNames();
    std::ostringstream expected;
    expected << " mi=" << static_cast<const void*>(instances_) << " ctx=";
    EXPECT_THAT(platform_.lines().at(0).message, HasSubstr(expected.str()));
    std::ostringstream ref;
    ref << " ref=" << static_cast<const void*>(classPath_);
    EXPECT_THAT(platform_.lines().at(0).message, HasSubstr(ref.str()));
}

TEST_F(IdentityTrace, Operations_that_end_early_have_no_exit_line) {
    getInstance({{"InstanceID", "other"}});
    expectLines("SimIdentity_GetInstance", getParams, false);
    getInstance({});
    expectLines("SimIdentity_GetInstance", getParams, false);
    broker_.failSlot("newObjectPath", 1, Fault::null());
    enumNames();
    expectLines("SimIdentity_EnumInstanceNames", enumNamesParams, false);
}

TEST_F(IdentityTrace, No_provider_marker_is_written) {
    enumNames();
    enumInstances();
    getInstance({{"InstanceID", identifier}});
    EXPECT_THAT(pointsIn("markProviderEntry"), IsEmpty());
    EXPECT_THAT(pointsIn("markProviderExit"), IsEmpty());
}

TEST_F(IdentityTrace, The_record_itself_is_not_traced) {
    enumInstances();
    for (const LogLine& line : platform_.lines()) {
        EXPECT_NE(line.file, "SimIdentity") << line.message;
    }
}

TEST_F(IdentityTrace, The_factory_traces_its_members_with_their_parameters) {
    enumNames();
    expectFactoryLines("getAllSimIdentityCMPIObjPaths", " broker=@ ref=@ objectPaths=@ status=@",
                       true);
    enumInstances();
    expectFactoryLines("makeSimIdentityInstance",
                       " broker=@ ref=@ simidentity=@ properties=0 IsObjPath=0 rc=@", true);
    getInstance({{"InstanceID", identifier}});
    expectFactoryLines("getOneSimIdentityCMPIInstance",
                       " broker=@ ref=@ key=@ properties=0 instances=@ rc=@", true);
}

TEST_F(IdentityTrace, An_instance_that_cannot_be_made_is_left_with_an_exit_line) {
    broker_.failSlot("newInstance", 1, Fault::null());
    enumInstances();
    expectFactoryLines("makeSimIdentityInstance",
                       " broker=@ ref=@ simidentity=@ properties=0 IsObjPath=0 rc=@", true);
}

TEST_F(IdentityTrace, Lines_of_operations_and_factory_are_at_level_3000_or_4000) {
    enumNames();
    enumInstances();
    getInstance({{"InstanceID", identifier}});
    for (const LogLine& line : platform_.lines()) {
        const bool variable = line.message.find("VARIABLE") == 0;
        EXPECT_EQ(line.level, variable ? 4000 : 3000) << line.message;
    }
}

} // namespace
} // namespace qelo::test
