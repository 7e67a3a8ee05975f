// Getting one capabilities object.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const Unit& provider = source::capabilitiesProvider;
constexpr const char* function = "SimAccountManagementCapabilities_GetInstance";

class CapabilitiesLookup : public CapabilitiesFixture {
protected:
    void expectMarkers(const std::string& message = "", bool ends = true) const {
        expectSamePoints(pointsOf(provider), markers(provider, function, ends, message));
    }
};

TEST_F(CapabilitiesLookup, A_known_id_returns_that_object) {
    serve({"/a", "/b"});
    expectOk(getInstance({{"InstanceID", capabilitiesId("/b")}}));
    EXPECT_THAT(returned("ElementName"), ElementsAre(capabilitiesId("/b")));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(platform_.pathComparisons(), IsEmpty());
    expectMarkers();
}

TEST_F(CapabilitiesLookup, A_property_list_is_honoured) {
    broker_.ignorePropertyFilter(true);
    serve({"/a"});
    getInstance({{"InstanceID", capabilitiesId("/a")}}, {{"ElementName"}});
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("InstanceID", "ElementName"));
}

TEST_F(CapabilitiesLookup, An_unknown_id_returns_success_no_instance_and_CMReturnDone) {
    serve({"/a"});
    for (const std::string& path : {std::string("/x"), std::string("/A"), std::string(600, 'x')}) {
        platform_.forget();
        expectOk(getInstance({{"InstanceID", capabilitiesId(path)}}));
        expectNothingReturned();
        EXPECT_EQ(broker_.doneCount(), 1);
        expectMarkers();
    }
}

TEST_F(CapabilitiesLookup, Without_keys_it_tells_so_and_succeeds_without_the_exit_line) {
    serve({"/a"});
    expectOk(getInstance({}));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    expectMarkers(keyMissingText, false);
}

TEST_F(CapabilitiesLookup, Keys_without_an_InstanceID_fall_back_to_comparing_whole_paths) {
    serve({"/a", "/b", "/c"});
    platform_.setPathAnswers({false, true, true});
    expectOk(getInstance({{"Name", "other"}}));
    EXPECT_THAT(returned("InstanceID"), ElementsAre(capabilitiesId("/b")));
    EXPECT_EQ(broker_.doneCount(), 1);
    ASSERT_EQ(platform_.pathComparisons().size(), 2U);
    EXPECT_FALSE(platform_.pathComparisons()[0].strict);
    expectMarkers();
}

TEST_F(CapabilitiesLookup, The_key_Name_is_not_looked_at) {
    serve({"/a"});
    platform_.setPathAnswers({false});
    expectOk(getInstance({{"Name", capabilitiesId("/a")}}));
    expectNothingReturned();
}

TEST_F(CapabilitiesLookup, A_fallback_without_a_match_returns_nothing_and_CMReturnDone) {
    serve({"/a", "/b"});
    platform_.setPathAnswers({false, false});
    expectOk(getInstance({{"Name", "other"}}));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    expectMarkers();
}

TEST_F(CapabilitiesLookup, An_InstanceID_without_a_text_falls_back_in_the_same_way) {
    serve({"/a", "/b"});
    platform_.setPathAnswers({false, true});
    const std::vector<Value> useless = {Value::nullOf(CMPI_string), Value::missing(CMPI_string),
                                        Value::withoutHandle(CMPI_string)};
    for (const Value& id : useless) {
        platform_.forget();
        expectOk(getInstance({{"InstanceID", id}}));
        EXPECT_THAT(returned("InstanceID"), ElementsAre(capabilitiesId("/b")));
    }
}

} // namespace
} // namespace qelo::test
