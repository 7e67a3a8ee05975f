// The account factory by itself: what the provider's operations never ask of it, and the
// results that they do not pass on.
#include "AccountFixture.h"

#include <account/SimAccountObjFactory.h>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimAccount;
using Tesk::SimpleIdentityManagementProvider::SimAccountFactory;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr int succeeded = 0;
constexpr int noneFound = 1;
constexpr int pathFailed = 2;

class AccountFactory : public AccountFixture {
protected:
    // Makes the instance of one account and reads what became of it.
    Instance make(SimAccountFactory& factory, const PropertyNames& properties, bool isObjPath) {
        SimAccount account;
        account.setName("alice");
        std::vector<const char*> list;
        CMPIInstance* instance = factory.makeSimAccountInstance(
            broker_.get(), classPath_, account, listOf(properties, list), isObjPath, nullptr);
        return broker_.inspect(instance);
    }

    std::vector<std::string> inspectNames(const std::vector<CMPIInstance*>& instances) const {
        std::vector<std::string> names;
        for (const CMPIInstance* instance : instances) {
            names.push_back(instance == nullptr ? "null"
                                                : broker_.inspect(instance).propertyText("Name"));
        }
        return names;
    }

    CMPIStatus untouched_{CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    std::vector<CMPIObjectPath*> paths_;
    std::vector<CMPIInstance*> made_;
};

TEST_F(AccountFactory, Made_without_flags_it_reads_nothing) {
    serve({accountNode("alice")});
    {
        SimAccountFactory factory;
        EXPECT_EQ(platform_.storeCallCount(), 0U);
        expectSamePoints(points(),
                         ExpectedTrace().method(unit::accountFactory, "SimAccountFactory"));
        EXPECT_EQ(factory.getNumberOfInstances(), 0U);
    }
    expectSamePoints(
        points(), ExpectedTrace()
                      .method(unit::accountFactory, "SimAccountFactory")
                      .entering(unit::accountFactory, "getNumberOfInstances")
                      .variable(unit::accountFactory, "getNumberOfInstances", "noOfInstances", "0")
                      .exiting(unit::accountFactory, "getNumberOfInstances")
                      .method(unit::accountFactory, "~SimAccountFactory"));
}

TEST_F(AccountFactory, The_flags_are_traced_and_change_nothing) {
    serve({accountNode("alice")});
    for (const bool isSen : {false, true}) {
        for (const bool isCap : {false, true}) {
            platform_.forget();
            SimAccountFactory factory(isSen, isCap);
            const std::string flags =
                std::string(" isSen=") + (isSen ? "1" : "0") + " isCap=" + (isCap ? "1" : "0");
            const auto expected =
                ExpectedTrace().entering(unit::accountFactory, "SimAccountFactory", flags);
            EXPECT_EQ(points().front(), expected.points().front());
            EXPECT_EQ(factory.getNumberOfInstances(), 1U);
        }
    }
}

TEST_F(AccountFactory, Two_records_with_one_name_count_once) {
    serve({accountNode("alice"), accountNode("bob"), accountNode("alice")});
    EXPECT_EQ(SimAccountFactory(true, false).getNumberOfInstances(), 2U);
}

TEST_F(AccountFactory, A_failed_listing_leaves_it_empty_although_records_were_read) {
    StoreNode strange = accountNode("bob");
    strange.properties[Tesk::NodeLexicon::AccountState] = 2U;
    serve({accountNode("alice"), strange});
    EXPECT_EQ(SimAccountFactory(true, false).getNumberOfInstances(), 0U);
}

// ---- instances ----

TEST_F(AccountFactory, Properties_null_with_isObjPath_true_gives_keys_only) {
    SimAccountFactory factory;
    EXPECT_THAT(make(factory, std::nullopt, true).propertyNames(),
                ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName", "Name"));
}

TEST_F(AccountFactory, Properties_null_with_isObjPath_false_gives_everything) {
    SimAccountFactory factory;
    EXPECT_EQ(make(factory, std::nullopt, false).properties.size(), 28U);
}

TEST_F(AccountFactory, A_list_is_honoured_whatever_isObjPath_says) {
    broker_.ignorePropertyFilter(true);
    SimAccountFactory factory;
    for (const bool isObjPath : {false, true}) {
        EXPECT_THAT(make(factory, {{"UserID"}}, isObjPath).propertyNames(),
                    ElementsAre("SystemCreationClassName", "SystemName", "CreationClassName",
                                "Name", "UserID"));
    }
}

TEST_F(AccountFactory, An_instance_is_null_when_its_path_or_itself_cannot_be_made) {
    SimAccountFactory factory;
    for (const char* slot : {"newObjectPath", "newInstance"}) {
        broker_.clearFaults();
        broker_.failSlot(slot, 0, Fault::null());
        EXPECT_EQ(factory.makeSimAccountInstance(broker_.get(), classPath_, SimAccount(), nullptr,
                                                 false, &untouched_),
                  nullptr)
            << slot;
    }
}

TEST_F(AccountFactory, All_instances_succeed_also_when_there_are_none) {
    serve({});
    SimAccountFactory factory(true, false);
    EXPECT_EQ(factory.getAllSimAccountCMPIInstances(broker_.get(), classPath_, nullptr, false,
                                                    made_, &untouched_),
              succeeded);
    EXPECT_THAT(made_, IsEmpty());
    EXPECT_EQ(untouched_.rc, CMPI_RC_ERR_ALREADY_EXISTS);
    EXPECT_THAT(broker_.traces(), IsEmpty());
}

TEST_F(AccountFactory, All_instances_include_the_null_ones) {
    serve({accountNode("bob"), accountNode("alice"), accountNode("carol")});
    SimAccountFactory factory(true, false);
    broker_.failSlot("newInstance", 2, Fault::null());
    EXPECT_EQ(factory.getAllSimAccountCMPIInstances(broker_.get(), classPath_, nullptr, false,
                                                    made_, nullptr),
              succeeded);
    EXPECT_THAT(inspectNames(made_), ElementsAre("alice", "null", "carol"));
}

TEST_F(AccountFactory, All_instances_with_isObjPath_have_keys_only) {
    serve({accountNode("alice")});
    SimAccountFactory factory(true, false);
    factory.getAllSimAccountCMPIInstances(broker_.get(), classPath_, nullptr, true, made_, nullptr);
    ASSERT_EQ(made_.size(), 1U);
    EXPECT_EQ(broker_.inspect(made_[0]).properties.size(), 4U);
}

TEST_F(AccountFactory, One_instance_is_found_by_its_exact_name) {
    serve({accountNode("bob"), accountNode("alice")});
    SimAccountFactory factory(true, false);
    EXPECT_EQ(factory.getOneSimAccountCMPIInstance(
                  broker_.get(), classPath_, broker_.makeString("alice"), nullptr, made_, nullptr),
              succeeded);
    EXPECT_THAT(inspectNames(made_), ElementsAre("alice"));
    EXPECT_EQ(factory.getOneSimAccountCMPIInstance(broker_.get(), classPath_,
                                                   broker_.makeString("Alice"), nullptr, made_,
                                                   &untouched_),
              noneFound);
    EXPECT_EQ(made_.size(), 1U);
    EXPECT_EQ(untouched_.rc, CMPI_RC_ERR_ALREADY_EXISTS);
}

TEST_F(AccountFactory, One_instance_is_appended_also_when_it_is_null) {
    serve({accountNode("alice")});
    SimAccountFactory factory(true, false);
    broker_.failSlot("newInstance", 1, Fault::null());
    EXPECT_EQ(factory.getOneSimAccountCMPIInstance(
                  broker_.get(), classPath_, broker_.makeString("alice"), nullptr, made_, nullptr),
              succeeded);
    EXPECT_THAT(inspectNames(made_), ElementsAre("null"));
}

TEST_F(AccountFactory, A_lookup_is_traced_with_its_parameters) {
    serve({accountNode("alice")});
    SimAccountFactory factory(true, false);
    platform_.forget();
    broker_.failSlot("newObjectPath", 1, Fault::null());
    factory.getOneSimAccountCMPIInstance(broker_.get(), classPath_, broker_.makeString("alice"),
                                         nullptr, made_, nullptr);
    const std::string one = " broker=@ ref=@ key=@ properties=0 instances=@ rc=0";
    const std::string make = " broker=@ ref=@ simAccount=@ properties=0 isObjPath=0 rc=0";
    expectSamePoints(withoutDestructors(points(), "~SimAccount"),
                     ExpectedTrace()
                         .entering(unit::accountFactory, "getOneSimAccountCMPIInstance", one)
                         .entering(unit::accountFactory, "makeSimAccountInstance", make)
                         .exiting(unit::accountFactory, "makeSimAccountInstance", make)
                         .exiting(unit::accountFactory, "getOneSimAccountCMPIInstance", one));
}

// ---- paths ----

TEST_F(AccountFactory, All_paths_answer_1_and_leave_the_status_when_there_are_none) {
    serve({});
    SimAccountFactory factory(true, false);
    EXPECT_EQ(factory.getAllSimAccountCMPIObjPaths(broker_.get(), classPath_, paths_, &untouched_),
              noneFound);
    EXPECT_EQ(untouched_.rc, CMPI_RC_ERR_ALREADY_EXISTS);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{1, "SimAccountProvider", "***No instance found***"}));
}

TEST_F(AccountFactory, All_paths_answer_2_and_keep_those_made_before) {
    serve({accountNode("alice"), accountNode("bob"), accountNode("carol")});
    SimAccountFactory factory(true, false);
    broker_.failSlot("newObjectPath", 3, Fault::null());
    CMPIStatus status{CMPI_RC_OK, nullptr};
    EXPECT_EQ(factory.getAllSimAccountCMPIObjPaths(broker_.get(), classPath_, paths_, &status),
              pathFailed);
    EXPECT_EQ(paths_.size(), 2U);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    ASSERT_NE(status.msg, nullptr);
    EXPECT_EQ(broker_.inspect(status.msg), "Create CMPIObjectPath failed.");
}

TEST_F(AccountFactory, All_paths_do_without_a_status) {
    serve({accountNode("alice")});
    SimAccountFactory factory(true, false);
    EXPECT_EQ(factory.getAllSimAccountCMPIObjPaths(broker_.get(), classPath_, paths_, nullptr),
              succeeded);
    broker_.failSlot("newObjectPath", 0, Fault::null());
    EXPECT_EQ(factory.getAllSimAccountCMPIObjPaths(broker_.get(), classPath_, paths_, nullptr),
              pathFailed);
    EXPECT_EQ(paths_.size(), 1U);
}

} // namespace
} // namespace qelo::test
