// Enumerating the names of capabilities.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const Unit& provider = source::capabilitiesProvider;
constexpr const char* function = "SimAccountManagementCapabilities_EnumInstanceNames";
constexpr const char* collectorFailed = "getAllSimAccountManagementCapabilitiesCMPIObjPaths Failed";

class CapabilitiesNames : public CapabilitiesFixture {};

TEST_F(CapabilitiesNames, Every_capabilities_object_is_named_in_order_of_its_id) {
    serve({"/b", "/a"});
    expectOk(enumNames());
    EXPECT_THAT(returned("InstanceID"), ElementsAre(capabilitiesId("/a"), capabilitiesId("/b")));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    expectSamePoints(pointsOf(provider), markers(provider, function, true));
}

TEST_F(CapabilitiesNames, A_path_has_host_namespace_class_and_one_key) {
    platform_.setSystemName("box7");
    serve({"/a"});
    enumNames();
    const Path path = onlyPath();
    EXPECT_EQ(path.host, "box7");
    EXPECT_EQ(path.nameSpace, requestNameSpace);
    EXPECT_EQ(path.className, capabilitiesClass);
    EXPECT_THAT(path.keys,
                ElementsAre(NamedValue{"InstanceID", Value::chars(capabilitiesId("/a"))}));
}

TEST_F(CapabilitiesNames, Id_and_service_name_of_one_node_end_in_the_same_path_text) {
    serve({"/services/1"});
    enumNames();
    const std::string prefix = "SimAccountManagementCapabilities_";
    const std::string id = onlyPath().keyText("InstanceID");
    ASSERT_EQ(id.substr(0, prefix.size()), prefix);
    EXPECT_EQ("SimAccountManagementService_" + id.substr(prefix.size()),
              serviceName("/services/1"));
}

TEST_F(CapabilitiesNames, Two_nodes_with_the_same_path_text_give_one_object) {
    serve({"/a", "/b", "/a"});
    enumNames();
    EXPECT_THAT(returned("InstanceID"), ElementsAre(capabilitiesId("/a"), capabilitiesId("/b")));
}

TEST_F(CapabilitiesNames, Without_a_node_success_no_names_and_no_CMReturnDone) {
    expectOk(enumNames());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{2, "SimAccountManagementCapabilitiesProvider",
                                        "***No instance found***"}));
    expectSamePoints(pointsOf(provider), markers(provider, function, false, collectorFailed));
}

TEST_F(CapabilitiesNames, A_path_that_cannot_be_made_fails_the_operation) {
    serve({"/a", "/b"});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        platform_.forget();
        broker_.clearFaults();
        broker_.failSlot("newObjectPath", 2, fault);
        expectFailed(enumNames(), "Create CMPIObjectPath failed");
        expectNothingReturned();
        EXPECT_EQ(broker_.doneCount(), 0);
        EXPECT_THAT(broker_.traces(),
                    ElementsAre(BrokerTrace{2, "SimAccountManagementCapabilitiesProvider",
                                            "Create CMPIObjectPath failed for                     "
                                            "SimAccountManagementCapabilities class"}));
        expectSamePoints(pointsOf(provider), markers(provider, function, false, collectorFailed));
    }
}

TEST_F(CapabilitiesNames, A_failing_store_is_told_on_standard_error_and_serves_nothing) {
    serve({"/a", "/b"});
    platform_.failOperation("getPathToNode", 2, StoreFault::ThrowsRuntimeError);
    testing::internal::CaptureStderr();
    const Outcome outcome = enumNames();
    EXPECT_EQ(testing::internal::GetCapturedStderr(), std::string(storeFailureText) + "\n");
    expectOk(outcome);
    expectNothingReturned();
    EXPECT_THAT(messages(), ElementsAre(collectorFailed)) << "not in the log";
}

} // namespace
} // namespace qelo::test
