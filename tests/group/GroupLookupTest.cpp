// Getting one group.
#include "GroupFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* keyMissing = "At least one key should be passed";

class GroupLookup : public GroupFixture {};

TEST_F(GroupLookup, A_known_name_returns_that_group) {
    serve({groupNode("wheel", {"root"}), groupNode("adm", {"eve"})});
    expectOk(getInstance(groupKeys("adm")));
    EXPECT_EQ(onlyInstance().propertyText("Name"), "adm");
    EXPECT_EQ(onlyInstance().propertyText("GroupMembers"), "eve");
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    expectSamePoints(pointsOf(source::groupProvider), plainLines("GetInstance", true));
}

TEST_F(GroupLookup, Only_the_key_Name_counts) {
    serve({groupNode("wheel"), groupNode("adm")});
    expectOk(getInstance({{"CreationClassName", "Other"}, {"Name", "adm"}}));
    EXPECT_THAT(returned("Name"), ElementsAre("adm"));
    EXPECT_THAT(platform_.pathComparisons(), IsEmpty());
}

TEST_F(GroupLookup, The_first_of_two_records_with_one_name_is_returned) {
    serve({groupNode("wheel", {"first"}), groupNode("wheel", {"second"})});
    getInstance(groupKeys("wheel"));
    EXPECT_EQ(onlyInstance().propertyText("GroupMembers"), "first");
}

TEST_F(GroupLookup, A_property_list_is_honoured) {
    broker_.ignorePropertyFilter(true);
    serve({groupNode("wheel")});
    getInstance(groupKeys("wheel"), {{"ElementName"}});
    EXPECT_THAT(onlyInstance().propertyNames(),
                ElementsAre("CreationClassName", "Name", "ElementName"));
}

TEST_F(GroupLookup, A_group_that_does_not_exist_answers_with_success_and_no_instance) {
    serve({groupNode("wheel")});
    expectOk(getInstance(groupKeys("staff")));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    EXPECT_THAT(messages(), IsEmpty());
    expectSamePoints(pointsOf(source::groupProvider), plainLines("GetInstance", false));
}

TEST_F(GroupLookup, Names_are_compared_exactly) {
    serve({groupNode("wheel")});
    for (const char* name : {"Wheel", "WHEEL", "whee", "wheel ", ""}) {
        expectOk(getInstance(groupKeys(name)));
        expectNothingReturned();
    }
}

TEST_F(GroupLookup, Without_keys_it_fails_and_tells_the_broker) {
    serve({groupNode("wheel")});
    expectFailed(getInstance({}), keyMissing);
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(), ElementsAre(BrokerTrace{2, "SimGroupProvider", keyMissing}));
    EXPECT_THAT(messages(), IsEmpty());
    EXPECT_EQ(platform_.countStoreCalls("getProperty(108,string)->wheel"), 0U);
}

TEST_F(GroupLookup, Without_keys_and_without_a_broker_the_status_has_no_text) {
    registerBroker(nullptr);
    expectFailed(getInstance({}), "");
    EXPECT_THAT(broker_.traces(), IsEmpty());
}

TEST_F(GroupLookup, A_path_with_only_a_CreationClassName_returns_every_group) {
    serve({groupNode("wheel"), groupNode("adm")});
    expectOk(getInstance({{"CreationClassName", "ZANTH_Group"}}));
    EXPECT_THAT(returned("Name"), ElementsAre("adm", "wheel"));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(platform_.pathComparisons(), IsEmpty()) << "no path is compared";
}

TEST_F(GroupLookup, The_fallback_honours_the_property_list) {
    broker_.ignorePropertyFilter(true);
    serve({groupNode("wheel")});
    getInstance({{"CreationClassName", "ZANTH_Group"}}, {{"ElementName"}});
    EXPECT_THAT(onlyInstance().propertyNames(),
                ElementsAre("CreationClassName", "Name", "ElementName"));
}

TEST_F(GroupLookup, A_Name_without_a_text_falls_back_in_the_same_way) {
    serve({groupNode("wheel"), groupNode("adm")});
    const std::vector<Value> useless = {Value::nullOf(CMPI_string), Value::missing(CMPI_string),
                                        Value::withoutHandle(CMPI_string)};
    for (const Value& name : useless) {
        expectOk(getInstance({{"CreationClassName", "ZANTH_Group"}, {"Name", name}}));
        EXPECT_THAT(returned("Name"), ElementsAre("adm", "wheel"));
        EXPECT_EQ(broker_.doneCount(), 1);
    }
}

TEST_F(GroupLookup, The_fallback_without_groups_returns_nothing_and_CMReturnDone) {
    serve({});
    expectOk(getInstance({{"CreationClassName", "ZANTH_Group"}}));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(GroupLookup, An_empty_name_finds_the_group_without_one) {
    serve({bareGroupNode(), groupNode("wheel")});
    expectOk(getInstance(groupKeys("")));
    EXPECT_THAT(returned("Name"), ElementsAre(""));
}

TEST_F(GroupLookup, A_found_group_whose_instance_cannot_be_made_is_no_failure) {
    serve({groupNode("wheel")});
    broker_.failSlot("newInstance", 1, Fault::null());
    expectOk(getInstance(groupKeys("wheel")));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
}

} // namespace
} // namespace qelo::test
