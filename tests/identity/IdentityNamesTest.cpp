// Enumerating the name of the identity.
#include "IdentityFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class IdentityNames : public IdentityFixture {};

TEST_F(IdentityNames, There_is_exactly_one_path) {
    expectOk(enumNames());
    EXPECT_THAT(returned("InstanceID"), ElementsAre(identifier));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
}

TEST_F(IdentityNames, There_is_exactly_one_whatever_the_store_holds) {
    platform_.addNode(administrationNode());
    for (int i = 0; i < 5; ++i) {
        platform_.addNode(accountNode("alice"));
        platform_.addNode({Tesk::NodeLexicon::AccountServiceRoot, "/services", {}});
    }
    platform_.setEntryCount(Tesk::NodeLexicon::UserAccount, 77);
    platform_.failStoreCall(1, StoreFault::ThrowsForeign);
    expectOk(enumNames());
    EXPECT_THAT(returned("InstanceID"), ElementsAre(identifier));
}

TEST_F(IdentityNames, A_path_has_host_namespace_class_and_one_key) {
    platform_.setSystemName("box7");
    classPath_ = broker_.makePath("root/other", "ZANTH_SimIdentity");
    enumNames();
    const Path path = onlyPath();
    EXPECT_EQ(path.host, "box7");
    EXPECT_EQ(path.nameSpace, "root/other");
    EXPECT_EQ(path.className, "ZANTH_SimIdentity");
    EXPECT_THAT(path.keys, ElementsAre(NamedValue{"InstanceID", Value::chars(identifier)}));
}

TEST_F(IdentityNames, A_path_that_cannot_be_made_fails_the_operation) {
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        broker_.clearFaults();
        broker_.failSlot("newObjectPath", 1, fault);
        expectFailed(enumNames(), "Create CMPIObjectPath failed");
        expectNothingReturned();
        EXPECT_EQ(broker_.doneCount(), 0);
        EXPECT_THAT(broker_.traces(),
                    ElementsAre(BrokerTrace{2, "SimIdentityProvider", identityPathFailedTrace}));
        EXPECT_THAT(messages(), IsEmpty());
    }
}

TEST_F(IdentityNames, A_status_text_that_cannot_be_made_leaves_the_code) {
    broker_.failSlot("newObjectPath", 1, Fault::null());
    broker_.failSlot("newString", 0, Fault::null());
    expectFailed(enumNames(), "");
}

TEST_F(IdentityNames, Without_a_broker_the_status_has_no_text) {
    registerBroker(nullptr);
    expectFailed(enumNames(), "");
    expectNothingReturned();
}

} // namespace
} // namespace qelo::test
