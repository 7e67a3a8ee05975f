// Capabilities whose lists the broker cannot make.
#include "ServiceFixture.h"

#include <service/SimAccountManagementCapabilitiesObjFactory.h>

namespace qelo::test {
namespace {

using testing::ElementsAre;

constexpr const char* component = "SimAccountManagementCapabilitiesProvider";

// The two texts differ in one letter, and both have 25 blanks within.
std::string statusText(const std::string& property) {
    return "Creating array for Property                         " + property + " failed.";
}
std::string traceText(const std::string& property) {
    return "Creating Array for Property                         " + property + " failed.";
}

class CapabilitiesArrays : public CapabilitiesFixture,
                           public testing::WithParamInterface<const char*> {
protected:
    CapabilitiesArrays() {
        serve({"/a"});
        broker_.ignorePropertyFilter(true);
    }
};

TEST_P(CapabilitiesArrays, An_array_that_cannot_be_made_fails_the_status_and_spares_the_instance) {
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        broker_.clearFaults();
        broker_.failSlot("newArray", 1, fault);
        expectFailed(enumInstances({{GetParam(), "ElementName"}}), statusText(GetParam()));
        EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("InstanceID", "ElementName"));
        EXPECT_THAT(broker_.traces(),
                    ElementsAre(BrokerTrace{2, component, traceText(GetParam())}));
    }
}

TEST_P(CapabilitiesArrays, Getting_one_instance_tells_the_same) {
    broker_.failSlot("newArray", 1, Fault::null());
    expectFailed(getInstance({{"InstanceID", capabilitiesId("/a")}}, {{GetParam()}}),
                 statusText(GetParam()));
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("InstanceID"));
    EXPECT_THAT(broker_.traces(), ElementsAre(BrokerTrace{2, component, traceText(GetParam())}));
}

TEST_P(CapabilitiesArrays, Comparing_paths_does_not_forget_it) {
    platform_.setPathAnswers({true});
    broker_.failSlot("newArray", 1, Fault::null());
    expectFailed(getInstance({{"Name", "other"}}, {{GetParam()}}), statusText(GetParam()));
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("InstanceID"));
}

INSTANTIATE_TEST_SUITE_P(Lists, CapabilitiesArrays,
                         testing::Values("RequestedStatesSupported", "OperationsSupported"),
                         [](const auto& test) { return std::string(test.param); });

class CapabilitiesLists : public CapabilitiesFixture {};

TEST_F(CapabilitiesLists, Both_arrays_failing_leave_the_other_properties_and_two_traces) {
    serve({"/a"});
    broker_.failSlot("newArray", 0, Fault::null());
    expectFailed(enumInstances(), statusText("OperationsSupported"));
    EXPECT_THAT(onlyInstance().propertyNames(),
                ElementsAre("InstanceID", "ElementNameEditSupported", "ElementName"));
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{2, component, traceText("RequestedStatesSupported")},
                            BrokerTrace{2, component, traceText("OperationsSupported")}));
}

TEST_F(CapabilitiesLists, A_list_is_made_with_its_size_and_filled_in_order) {
    serve({"/a"});
    enumInstances({{"OperationsSupported"}});
    std::vector<std::string> arrayCalls;
    for (const std::string& call : broker_.calls()) {
        if (call.find("newArray") == 0 || call.find("setElementAt") == 0) {
            arrayCalls.push_back(call);
        }
    }
    EXPECT_THAT(arrayCalls, ElementsAre("newArray(3,uint16)", "setElementAt(0,uint16,2)",
                                        "setElementAt(1,uint16,3)", "setElementAt(2,uint16,4)"));
}

TEST_F(CapabilitiesLists, The_factory_needs_no_status_to_tell_the_broker) {
    using Tesk::SimpleIdentityManagementProvider::SimAccountManagementCapabilities;
    using Tesk::SimpleIdentityManagementProvider::SimAccountManagementCapabilitiesFactory;
    broker_.failSlot("newArray", 0, Fault::null());
    broker_.beginCall();
    SimAccountManagementCapabilitiesFactory factory;
    const CMPIInstance* instance = factory.makeSimAccountManagementCapabilitiesInstance(
        broker_.get(), classPath_, SimAccountManagementCapabilities(), nullptr, false, nullptr);
    ASSERT_NE(instance, nullptr);
    EXPECT_EQ(broker_.inspect(instance).properties.size(), 3U);
    EXPECT_EQ(broker_.traces().size(), 2U);
    EXPECT_EQ(broker_.callCount("newString"), 0U);
    broker_.endCall();
}

} // namespace
} // namespace qelo::test
