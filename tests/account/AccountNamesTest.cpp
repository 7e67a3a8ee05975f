// Enumerating the names of accounts.
#include "AccountFixture.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

class AccountNames : public AccountFixture {};

TEST_F(AccountNames, Every_account_is_named_in_name_order) {
    serve({accountNode("zoe"), accountNode("Bob"), accountNode("alice"), accountNode("al")});
    expectSuccess(enumNames());
    EXPECT_THAT(returnedNames(), ElementsAre("Bob", "al", "alice", "zoe"));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    EXPECT_THAT(failureTexts(), IsEmpty());
    EXPECT_TRUE(exitMarked());
}

TEST_F(AccountNames, A_path_has_host_namespace_class_and_four_keys_in_order) {
    platform_.setSystemName("box7");
    serve({accountNode("alice")});
    enumNames();
    const std::vector<Path> paths = broker_.returnedPaths();
    ASSERT_EQ(paths.size(), 1U);
    EXPECT_EQ(paths[0].host, "box7");
    EXPECT_EQ(paths[0].nameSpace, "root/cimv2");
    EXPECT_EQ(paths[0].className, "ZANTH_Account");
    EXPECT_THAT(
        paths[0].keys,
        ElementsAre(NamedValue{"SystemCreationClassName", Value::chars("ZANTH_ComputerSystem")},
                    NamedValue{"SystemName", Value::chars("box7")},
                    NamedValue{"CreationClassName", Value::chars("ZANTH_Account")},
                    NamedValue{"Name", Value::chars("alice")}));
}

TEST_F(AccountNames, The_namespace_is_that_of_the_request) {
    classPath_ = broker_.makePath("root/other", "ZANTH_Account");
    serve({accountNode("alice")});
    enumNames();
    ASSERT_EQ(broker_.returnedPaths().size(), 1U);
    EXPECT_EQ(broker_.returnedPaths()[0].nameSpace, "root/other");
}

TEST_F(AccountNames, No_instance_is_made_for_a_name) {
    serve({accountNode("alice")});
    enumNames();
    EXPECT_EQ(broker_.callCount("newInstance"), 0U);
}

TEST_F(AccountNames, No_accounts_return_nothing_and_no_CMReturnDone) {
    serve({});
    expectSuccess(enumNames());
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{1, "SimAccountProvider", "***No instance found***"}));
    EXPECT_THAT(failureTexts(), ElementsAre("getAllSimAccountCMPIObjPaths Failed"));
    EXPECT_FALSE(exitMarked());
}

TEST_F(AccountNames, The_failure_line_is_the_operations_own) {
    serve({});
    enumNames();
    EXPECT_THAT(points(), Contains("6000 Corvane.SimAccountProvider SimAccount_EnumInstanceNames "
                                   "SimAccountProvider: MESSAGE [File: SimAccountProvider, Line: "
                                   "#]: getAllSimAccountCMPIObjPaths Failed"));
}

TEST_F(AccountNames, A_path_that_cannot_be_made_fails_the_operation) {
    serve({accountNode("alice"), accountNode("bob")});
    broker_.failSlot("newObjectPath", 2, Fault::null());
    expectFailure(enumNames(), "Create CMPIObjectPath failed.");
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{2, "SimAccountProvider",
                                        "Create CMPIObjectPath                     failed for "
                                        "RecordLogClass."}));
    EXPECT_THAT(failureTexts(), ElementsAre("getAllSimAccountCMPIObjPaths Failed"));
    EXPECT_FALSE(exitMarked());
}

TEST_F(AccountNames, A_path_without_a_handle_fails_in_the_same_way) {
    serve({accountNode("alice")});
    broker_.failSlot("newObjectPath", 1, Fault::nullHandle());
    expectFailure(enumNames(), "Create CMPIObjectPath failed.");
    EXPECT_EQ(broker_.doneCount(), 0);
}

TEST_F(AccountNames, A_status_text_that_cannot_be_made_leaves_the_code) {
    serve({accountNode("alice")});
    broker_.failSlot("newObjectPath", 1, Fault::null());
    broker_.failSlot("newString", 0, Fault::null());
    const Outcome outcome = enumNames();
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(outcome.hasMessage);
}

TEST_F(AccountNames, A_broker_that_refuses_traces_changes_nothing) {
    broker_.refuseTraces(true);
    serve({});
    expectSuccess(enumNames());
    EXPECT_EQ(broker_.traces().size(), 1U);
}

TEST_F(AccountNames, An_account_named_twice_is_named_once) {
    serve({accountNode("alice"), accountNode("alice")});
    enumNames();
    EXPECT_THAT(returnedNames(), ElementsAre("alice"));
}

TEST_F(AccountNames, An_account_without_a_name_is_served_under_the_empty_one) {
    serve({bareAccountNode(), accountNode("alice")});
    expectSuccess(enumNames());
    EXPECT_THAT(returnedNames(), ElementsAre("", "alice"));
}

TEST_F(AccountNames, A_refused_AccountState_serves_nothing_of_the_whole_list) {
    StoreNode strange = accountNode("bob");
    strange.properties[Tesk::NodeLexicon::AccountState] = 17U;
    serve({accountNode("alice"), strange});
    expectSuccess(enumNames());
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(failureTexts(), ElementsAre("Failed while setting Requested State",
                                            "getAllSimAccountCMPIObjPaths Failed"));
}

TEST_F(AccountNames, A_failing_store_serves_nothing_and_succeeds) {
    serve({accountNode("alice")});
    platform_.failOperation("selectNode", 3, StoreFault::ThrowsRuntimeError);
    expectSuccess(enumNames());
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
    EXPECT_THAT(failureTexts(),
                ElementsAre("the store failed", "getAllSimAccountCMPIObjPaths Failed"));
}

TEST_F(AccountNames, Nothing_is_kept_between_requests) {
    serve({accountNode("alice")});
    enumNames();
    platform_.addNode(accountNode("bob"));
    enumNames();
    EXPECT_THAT(returnedNames(), ElementsAre("alice", "bob"));
}

TEST_F(AccountNames, The_second_brokers_objects_are_used_after_a_second_creation) {
    serve({accountNode("alice")});
    RecordingBroker second;
    EXPECT_EQ(ProviderLibrary::instance().instanceMI("SimAccountProvider", second.get()),
              instances_);
    const CMPIObjectPath* path = second.makePath("root/cimv2", "ZANTH_Account");
    second.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->enumerateInstanceNames(instances_, context, result, path);
    });
    EXPECT_EQ(second.callCount("newObjectPath"), 1U);
    EXPECT_EQ(second.returnedPaths().size(), 1U);
    EXPECT_THAT(second.violations(), IsEmpty());
}

} // namespace
} // namespace qelo::test
