// Getting the identity.
#include "IdentityFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* keyMissing = "At least one key should be passed";

class IdentityLookup : public IdentityFixture {};

TEST_F(IdentityLookup, Its_identifier_returns_it) {
    expectOk(getInstance({{"InstanceID", identifier}}));
    EXPECT_THAT(returned("ElementName"), ElementsAre(identifier));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
}

TEST_F(IdentityLookup, A_property_list_is_honoured) {
    broker_.ignorePropertyFilter(true);
    getInstance({{"InstanceID", identifier}}, {{"InstanceID"}});
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("InstanceID"));
}

TEST_F(IdentityLookup, Another_mix_of_upper_and_lower_case_yields_nothing_and_success) {
    for (const char* other : {"zanth:simidentity1", "ZANTH:SIMIDENTITY1", "ZANTH:SimIdentity", "",
                              "ZANTH:SimIdentity1 "}) {
        expectOk(getInstance({{"InstanceID", other}}));
        expectNothingReturned();
        EXPECT_EQ(broker_.doneCount(), 0);
        EXPECT_THAT(broker_.traces(), IsEmpty());
        EXPECT_THAT(messages(), IsEmpty());
    }
}

TEST_F(IdentityLookup, Without_keys_it_fails_and_tells_the_broker) {
    expectFailed(getInstance({}), keyMissing);
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(), ElementsAre(BrokerTrace{2, "SimIdentityProvider", keyMissing}));
}

TEST_F(IdentityLookup, Without_keys_and_without_a_broker_the_status_has_no_text) {
    registerBroker(nullptr);
    expectFailed(getInstance({}), "");
}

TEST_F(IdentityLookup, A_path_with_only_other_keys_yields_the_identity) {
    expectOk(getInstance({{"Name", "whatever"}, {"CreationClassName", "Other"}}));
    EXPECT_THAT(returned("InstanceID"), ElementsAre(identifier));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(platform_.pathComparisons(), IsEmpty());
}

TEST_F(IdentityLookup, The_fallback_honours_the_property_list) {
    broker_.ignorePropertyFilter(true);
    getInstance({{"Name", "whatever"}}, {{"InstanceID"}});
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("InstanceID"));
}

TEST_F(IdentityLookup, An_InstanceID_without_a_text_falls_back_in_the_same_way) {
    const std::vector<Value> useless = {Value::nullOf(CMPI_string), Value::missing(CMPI_string),
                                        Value::withoutHandle(CMPI_string)};
    for (const Value& id : useless) {
        expectOk(getInstance({{"InstanceID", id}}));
        EXPECT_THAT(returned("InstanceID"), ElementsAre(identifier));
        EXPECT_EQ(broker_.doneCount(), 1);
    }
}

TEST_F(IdentityLookup, An_identifier_of_600_hostile_characters_yields_nothing) {
    for (const std::string& id :
         {std::string(600, 'i'), std::string("%s%n"), std::string("\xFF\x01\n")}) {
        expectOk(getInstance({{"InstanceID", id}}));
        expectNothingReturned();
    }
}

} // namespace
} // namespace qelo::test
