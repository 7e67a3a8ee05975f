// Enumerating the names of services.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* function = "SimAccountManagementService_EnumInstanceNames";
constexpr const char* collectorFailed = "getAllSimAccountManagementServiceCMPIObjPaths Failed";

class ServiceNames : public ServiceFixture {};

TEST_F(ServiceNames, Every_service_is_named_in_name_order) {
    serve({"/b", "/a", "/c"});
    expectOk(enumNames());
    EXPECT_THAT(returned("Name"),
                ElementsAre(serviceName("/a"), serviceName("/b"), serviceName("/c")));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    expectSamePoints(pointsOf(source::serviceProvider),
                     markers(source::serviceProvider, function, true));
}

TEST_F(ServiceNames, A_path_has_host_namespace_class_and_four_keys_in_order) {
    platform_.setSystemName("box7");
    classPath_ = broker_.makePath("root/other", serviceClass);
    serve({"/a"});
    enumNames();
    const Path path = onlyPath();
    EXPECT_EQ(path.host, "box7");
    EXPECT_EQ(path.nameSpace, "root/other");
    EXPECT_EQ(path.className, serviceClass);
    EXPECT_THAT(path.keys, ElementsAre(NamedValue{"SystemCreationClassName",
                                                  Value::chars("ZANTH_ComputerSystem")},
                                       NamedValue{"SystemName", Value::chars("box7")},
                                       NamedValue{"CreationClassName", Value::chars(serviceClass)},
                                       NamedValue{"Name", Value::chars(serviceName("/a"))}));
}

TEST_F(ServiceNames, The_namespace_is_set_once_more_at_delivery) {
    serve({"/a", "/b"});
    enumNames();
    EXPECT_EQ(broker_.callCount("setNameSpace"), 4U);
}

TEST_F(ServiceNames, Two_nodes_with_the_same_path_text_give_one_service) {
    serve({"/a", "/b", "/a"});
    enumNames();
    EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/a"), serviceName("/b")));
}

TEST_F(ServiceNames, Without_a_node_success_no_names_and_no_CMReturnDone) {
    expectOk(enumNames());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(), ElementsAre(BrokerTrace{1, "SimAccountManagementServiceProvider",
                                                          "***No instance found***"}));
    expectSamePoints(pointsOf(source::serviceProvider),
                     markers(source::serviceProvider, function, false, collectorFailed));
}

TEST_F(ServiceNames, A_path_that_cannot_be_made_fails_the_operation) {
    serve({"/a", "/b"});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        platform_.forget();
        broker_.clearFaults();
        broker_.failSlot("newObjectPath", 2, fault);
        expectFailed(enumNames(), "Create CMPIObjectPath failed.");
        expectNothingReturned();
        EXPECT_EQ(broker_.doneCount(), 0);
        EXPECT_THAT(broker_.traces(),
                    ElementsAre(BrokerTrace{2, "SimAccountManagementServiceProvider",
                                            "Create CMPIObjectPath                     failed "
                                            "for RecordLogClass."}));
        expectSamePoints(pointsOf(source::serviceProvider),
                         markers(source::serviceProvider, function, false, collectorFailed));
    }
}

TEST_F(ServiceNames, Without_a_broker_the_status_has_no_text) {
    serve({"/a"});
    registerBroker(nullptr);
    expectFailed(enumNames(), "");
}

TEST_F(ServiceNames, A_failing_store_serves_nothing_and_succeeds) {
    serve({"/a", "/b"});
    platform_.failOperation("convertPathToString", 2, StoreFault::ThrowsRuntimeError);
    expectOk(enumNames());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(messages(), ElementsAre(storeFailureText, collectorFailed));
}

TEST_F(ServiceNames, Nothing_is_written_to_the_store) {
    serve({"/a"});
    platform_.setEntryCount(Tesk::NodeLexicon::AccountServiceRoot, 9);
    enumNames();
    for (const StoreCall& call : platform_.storeCalls()) {
        EXPECT_NE(call.operation, "setProperty");
    }
}

TEST_F(ServiceNames, Hostile_path_texts_are_served_unchanged) {
    const std::vector<std::string> paths = {std::string(600, 'p'), "%s%n", "\xFF\x01\n", "a,b:\"c"};
    for (const std::string& path : paths) {
        platform_.reset();
        serve({path});
        expectOk(enumNames());
        EXPECT_THAT(returned("Name"), ElementsAre(serviceName(path)));
    }
}

} // namespace
} // namespace qelo::test
