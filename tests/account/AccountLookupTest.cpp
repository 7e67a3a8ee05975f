// Getting one account.
#include "AccountFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class AccountLookup : public AccountFixture {};

TEST_F(AccountLookup, A_known_name_returns_that_account) {
    serve({fullAccountNode("alice"), fullAccountNode("bob")});
    expectSuccess(getInstance(accountKeys("bob")));
    EXPECT_THAT(returnedNames(), ElementsAre("bob"));
    EXPECT_EQ(onlyInstance().properties.size(), 28U);
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(failureTexts(), IsEmpty());
    EXPECT_TRUE(exitMarked());
}

TEST_F(AccountLookup, Only_the_key_Name_counts) {
    serve({accountNode("alice")});
    expectSuccess(getInstance({{"Name", "alice"}, {"SystemName", "elsewhere"}}));
    EXPECT_THAT(returnedNames(), ElementsAre("alice"));
    EXPECT_THAT(platform_.pathComparisons(), IsEmpty());
}

TEST_F(AccountLookup, A_property_list_is_honoured) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    getInstance(accountKeys("alice"), {{"UserID"}});
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("SystemCreationClassName", "SystemName",
                                                            "CreationClassName", "Name", "UserID"));
}

TEST_F(AccountLookup, A_name_that_no_account_has_returns_success_no_instance_no_CMReturnDone) {
    serve({accountNode("alice")});
    expectSuccess(getInstance(accountKeys("mallory")));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(failureTexts(), ElementsAre("getOneSimAccountCMPIInstance Failed"));
    EXPECT_FALSE(exitMarked());
    EXPECT_THAT(broker_.traces(), IsEmpty());
}

TEST_F(AccountLookup, Names_are_compared_exactly) {
    serve({accountNode("alice")});
    getInstance(accountKeys("Alice"));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    getInstance(accountKeys("alice "));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    getInstance(accountKeys("alic"));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
}

TEST_F(AccountLookup, Without_accounts_a_name_is_unknown) {
    serve({});
    expectSuccess(getInstance(accountKeys("alice")));
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(failureTexts(), ElementsAre("getOneSimAccountCMPIInstance Failed"));
}

TEST_F(AccountLookup, An_empty_key_set_returns_success_and_only_CMReturnDone) {
    serve({accountNode("alice")});
    expectSuccess(getInstance({}));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(failureTexts(), ElementsAre("At least one key should be passed"));
    EXPECT_TRUE(exitMarked());
}

TEST_F(AccountLookup, An_empty_key_set_reads_no_account) {
    serve({accountNode("alice")});
    getInstance({});
    EXPECT_EQ(platform_.countStoreCalls("setFilter(1,/admin)"), 0U);
}

// Paths are compared by the platform; what it says is scripted here, since this broker, which
// knows no classes, gives the path of an instance no keys.

TEST_F(AccountLookup, Without_the_key_Name_the_first_account_whose_path_matches_is_returned) {
    serve({accountNode("zoe"), accountNode("bob"), accountNode("carol"), accountNode("alice")});
    platform_.setPathAnswers({false, true, true});
    expectSuccess(getInstance({{"SystemCreationClassName", "ZANTH_ComputerSystem"},
                               {"SystemName", "host.example"},
                               {"CreationClassName", "ZANTH_Account"}}));
    EXPECT_THAT(returnedNames(), ElementsAre("bob"));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_TRUE(exitMarked());
    EXPECT_THAT(failureTexts(), IsEmpty());
}

TEST_F(AccountLookup, The_comparison_stops_at_the_first_match) {
    serve({accountNode("bob"), accountNode("alice"), accountNode("carol")});
    platform_.setPathAnswers({false, true});
    getInstance({{"SystemName", "host.example"}});
    EXPECT_EQ(platform_.pathComparisons().size(), 2U);
}

TEST_F(AccountLookup, The_request_is_compared_with_each_instances_own_path_not_strictly) {
    serve({accountNode("bob"), accountNode("alice")});
    const CMPIObjectPath* request =
        broker_.makePath(accountNameSpace, "ZANTH_Account", {{"SystemName", "elsewhere"}});
    broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->getInstance(instances_, context, result, request, nullptr);
    });
    const std::vector<PathComparison> comparisons = platform_.pathComparisons();
    ASSERT_EQ(comparisons.size(), 2U);
    for (const PathComparison& comparison : comparisons) {
        EXPECT_EQ(comparison.wanted, request);
        EXPECT_FALSE(comparison.strict);
    }
    EXPECT_EQ(broker_.callCount("getObjectPath"), 2U);
}

TEST_F(AccountLookup, Without_the_key_Name_and_without_a_match_nothing_is_returned) {
    serve({accountNode("bob"), accountNode("alice")});
    platform_.setPathAnswers({false, false});
    expectSuccess(getInstance({{"SystemName", "elsewhere"}}));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_EQ(platform_.pathComparisons().size(), 2U);
    EXPECT_THAT(failureTexts(), IsEmpty());
    EXPECT_TRUE(exitMarked());
}

TEST_F(AccountLookup, Without_the_key_Name_and_without_accounts_nothing_is_returned) {
    serve({});
    expectSuccess(getInstance({{"SystemName", "host.example"}}));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(AccountLookup, Without_the_key_Name_the_property_list_is_honoured) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    platform_.setPathAnswers({true});
    getInstance({{"SystemName", "host.example"}}, {{"UserID"}});
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("SystemCreationClassName", "SystemName",
                                                            "CreationClassName", "Name", "UserID"));
}

TEST_F(AccountLookup, A_Name_without_a_text_counts_as_absent) {
    serve({accountNode("bob"), accountNode("alice")});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        platform_.forget();
        platform_.setPathAnswers({false, true});
        broker_.clearFaults();
        broker_.failSlot("getKey", 1, fault);
        expectSuccess(getInstance(accountKeys("alice")));
        EXPECT_THAT(returnedNames(), ElementsAre("bob"));
    }
}

TEST_F(AccountLookup, Instances_that_could_not_be_made_are_passed_over_in_the_comparison) {
    serve({accountNode("alice"), accountNode("bob"), accountNode("carol")});
    platform_.setPathAnswers({true});
    broker_.failSlot("newInstance", 1, Fault::null());
    broker_.failSlot("newInstance", 2, Fault::nullHandle());
    expectSuccess(getInstance({{"SystemName", "host.example"}}));
    EXPECT_THAT(returnedNames(), ElementsAre("carol"));
    EXPECT_EQ(platform_.pathComparisons().size(), 1U);
}

TEST_F(AccountLookup, The_class_of_the_path_is_not_asked) {
    serve({accountNode("alice")});
    const CMPIObjectPath* path =
        broker_.makePath(accountNameSpace, "ZANTH_Group", {{"Name", "alice"}});
    broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->getInstance(instances_, context, result, path, nullptr);
    });
    EXPECT_THAT(returnedNames(), ElementsAre("alice"));
}

TEST_F(AccountLookup, The_later_of_two_records_with_one_name_is_returned) {
    StoreNode later = accountNode("alice");
    later.properties[Tesk::NodeLexicon::UserID] = "2002";
    serve({fullAccountNode("alice"), later});
    getInstance(accountKeys("alice"));
    EXPECT_EQ(onlyInstance().propertyText("UserID"), "2002");
}

} // namespace
} // namespace qelo::test
