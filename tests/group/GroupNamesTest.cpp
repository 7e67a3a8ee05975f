// Enumerating the names of groups.
#include "GroupFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class GroupNames : public GroupFixture {};

TEST_F(GroupNames, Every_group_is_named_in_name_order) {
    serve({groupNode("wheel"), groupNode("Staff"), groupNode("adm"), groupNode("ad")});
    expectOk(enumNames());
    EXPECT_THAT(returned("Name"), ElementsAre("Staff", "ad", "adm", "wheel"));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    EXPECT_THAT(messages(), IsEmpty());
}

TEST_F(GroupNames, A_path_has_host_namespace_class_and_two_keys_in_order) {
    platform_.setSystemName("box7");
    serve({groupNode("wheel")});
    enumNames();
    const Path path = onlyPath();
    EXPECT_EQ(path.host, "box7");
    EXPECT_EQ(path.nameSpace, requestNameSpace);
    EXPECT_EQ(path.className, "ZANTH_Group");
    EXPECT_THAT(path.keys, ElementsAre(NamedValue{"CreationClassName", Value::chars("ZANTH_Group")},
                                       NamedValue{"Name", Value::chars("wheel")}));
}

TEST_F(GroupNames, The_namespace_is_that_of_the_request_and_set_once_more_at_delivery) {
    classPath_ = broker_.makePath("root/other", "ZANTH_Group");
    serve({groupNode("wheel"), groupNode("adm")});
    enumNames();
    for (const Path& path : broker_.returnedPaths()) {
        EXPECT_EQ(path.nameSpace, "root/other");
    }
    EXPECT_EQ(broker_.callCount("setNameSpace"), 4U);
}

TEST_F(GroupNames, No_instance_is_made_for_a_name) {
    serve({groupNode("wheel")});
    enumNames();
    EXPECT_EQ(broker_.callCount("newInstance"), 0U);
}

TEST_F(GroupNames, A_group_named_twice_is_enumerated_once) {
    serve({groupNode("wheel", {"first"}), groupNode("adm"), groupNode("wheel", {"second"})});
    enumNames();
    EXPECT_THAT(returned("Name"), ElementsAre("adm", "wheel"));
}

TEST_F(GroupNames, A_group_without_a_name_is_served_under_the_empty_one) {
    serve({bareGroupNode(), groupNode("wheel")});
    expectOk(enumNames());
    EXPECT_THAT(returned("Name"), ElementsAre("", "wheel"));
}

TEST_F(GroupNames, No_groups_end_with_success_no_names_and_no_CMReturnDone) {
    serve({});
    expectOk(enumNames());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{1, "SimGroupProvider", "***No instance found***"}));
    EXPECT_THAT(messages(), IsEmpty());
    expectSamePoints(pointsOf(source::groupProvider), plainLines("EnumInstanceNames", false));
}

TEST_F(GroupNames, A_path_that_cannot_be_made_fails_the_operation) {
    serve({groupNode("wheel"), groupNode("adm")});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        platform_.forget();
        broker_.clearFaults();
        broker_.failSlot("newObjectPath", 2, fault);
        expectFailed(enumNames(), "Create CMPIObjectPath failed.");
        expectNothingReturned();
        EXPECT_EQ(broker_.doneCount(), 0);
        EXPECT_THAT(broker_.traces(),
                    ElementsAre(BrokerTrace{2, "SimGroupProvider", pathFailedTrace}));
        EXPECT_THAT(messages(), IsEmpty());
        expectSamePoints(pointsOf(source::groupProvider), plainLines("EnumInstanceNames", false));
    }
}

TEST_F(GroupNames, A_status_text_that_cannot_be_made_leaves_the_code) {
    serve({groupNode("wheel")});
    broker_.failSlot("newObjectPath", 1, Fault::null());
    broker_.failSlot("newString", 0, Fault::nullHandle());
    expectFailed(enumNames(), "");
}

TEST_F(GroupNames, Without_a_broker_the_status_has_no_text) {
    serve({groupNode("wheel")});
    registerBroker(nullptr);
    expectFailed(enumNames(), "");
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
}

TEST_F(GroupNames, A_broker_that_refuses_traces_changes_nothing) {
    broker_.refuseTraces(true);
    serve({});
    expectOk(enumNames());
    EXPECT_EQ(broker_.traces().size(), 1U);
}

TEST_F(GroupNames, A_failing_store_serves_nothing_and_succeeds) {
    serve({groupNode("wheel"), groupNode("adm")});
    // The first reading belongs to the refresh, the others to the listing.
    platform_.failOperation("getProperty", 4, StoreFault::ThrowsRuntimeError);
    expectOk(enumNames());
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(messages(), ElementsAre("the store failed"));
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{1, "SimGroupProvider", "***No instance found***"}));
}

TEST_F(GroupNames, Nothing_is_kept_between_requests) {
    serve({groupNode("wheel")});
    enumNames();
    platform_.addNode(groupNode("adm"));
    enumNames();
    EXPECT_THAT(returned("Name"), ElementsAre("adm", "wheel"));
}

} // namespace
} // namespace qelo::test
