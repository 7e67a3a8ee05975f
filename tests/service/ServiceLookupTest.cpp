// Getting one service.
#include "ServiceFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* function = "SimAccountManagementService_GetInstance";

class ServiceLookup : public ServiceFixture {
protected:
    void expectMarkers(const std::string& message = "", bool ends = true) const {
        expectSamePoints(pointsOf(source::serviceProvider),
                         markers(source::serviceProvider, function, ends, message));
    }

    const std::vector<NamedValue> withoutName_ = {{"SystemName", "host.example"}};
};

TEST_F(ServiceLookup, A_known_name_returns_that_service) {
    serve({"/a", "/b"});
    expectOk(getInstance(serviceKeys("/b")));
    EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/b")));
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(platform_.pathComparisons(), IsEmpty());
    expectMarkers();
}

TEST_F(ServiceLookup, Only_the_key_Name_counts) {
    serve({"/a"});
    expectOk(getInstance({{"Name", serviceName("/a")}, {"SystemName", "elsewhere"}}));
    EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/a")));
}

TEST_F(ServiceLookup, A_property_list_is_honoured) {
    broker_.ignorePropertyFilter(true);
    serve({"/a"});
    getInstance(serviceKeys("/a"), {{"EnabledState"}});
    EXPECT_EQ(onlyInstance().propertyNames().size(), 5U);
    EXPECT_EQ(onlyInstance().propertyText("EnabledState"), "2");
}

TEST_F(ServiceLookup, A_Name_that_matches_no_record_returns_success_no_instance_and_CMReturnDone) {
    serve({"/a"});
    for (const std::string& path : {std::string("/x"), std::string("/A"), std::string(600, 'x')}) {
        platform_.forget();
        expectOk(getInstance(serviceKeys(path)));
        expectNothingReturned();
        EXPECT_EQ(broker_.doneCount(), 1);
        EXPECT_THAT(broker_.traces(), IsEmpty());
        expectMarkers();
    }
}

TEST_F(ServiceLookup, Without_keys_it_tells_so_and_succeeds_without_the_exit_line) {
    serve({"/a"});
    expectOk(getInstance({}));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    EXPECT_EQ(platform_.storeCallCount(), 0U);
    expectMarkers(keyMissingText, false);
}

TEST_F(ServiceLookup, Keys_that_cannot_be_counted_are_none) {
    serve({"/a"});
    broker_.failSlot("getKeyCount", 1, Fault::error(CMPI_RC_ERR_ACCESS_DENIED, "no access"));
    expectOk(getInstance(serviceKeys("/a")));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(ServiceLookup, Keys_without_a_Name_fall_back_to_comparing_whole_paths) {
    serve({"/a", "/b", "/c"});
    platform_.setPathAnswers({false, true, true});
    expectOk(getInstance(withoutName_));
    EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/b"))) << "the first match alone";
    EXPECT_EQ(broker_.doneCount(), 1);
    const std::vector<PathComparison> comparisons = platform_.pathComparisons();
    ASSERT_EQ(comparisons.size(), 2U);
    EXPECT_FALSE(comparisons[0].strict);
    EXPECT_FALSE(comparisons[1].strict);
    expectMarkers();
}

TEST_F(ServiceLookup, The_request_is_compared_with_the_instances_own_path) {
    serve({"/a"});
    const CMPIObjectPath* request = broker_.makePath(requestNameSpace, serviceClass, withoutName_);
    broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->getInstance(instances_, context, result, request, nullptr);
    });
    ASSERT_EQ(platform_.pathComparisons().size(), 1U);
    EXPECT_EQ(platform_.pathComparisons()[0].wanted, request);
    EXPECT_EQ(broker_.callCount("getObjectPath"), 1U);
}

TEST_F(ServiceLookup, A_fallback_without_a_match_returns_nothing_and_CMReturnDone) {
    serve({"/a", "/b"});
    platform_.setPathAnswers({false, false});
    expectOk(getInstance(withoutName_));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    expectMarkers();
}

TEST_F(ServiceLookup, The_fallback_passes_over_null_instances) {
    serve({"/a", "/b", "/c"});
    platform_.setPathAnswers({true});
    broker_.failSlot("newInstance", 1, Fault::null());
    broker_.failSlot("newInstance", 2, Fault::nullHandle());
    expectOk(getInstance(withoutName_));
    EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/c")));
}

TEST_F(ServiceLookup, The_fallback_honours_the_property_list) {
    broker_.ignorePropertyFilter(true);
    serve({"/a"});
    platform_.setPathAnswers({true});
    getInstance(withoutName_, {{"EnabledState"}});
    EXPECT_EQ(onlyInstance().propertyNames().size(), 5U);
}

TEST_F(ServiceLookup, A_Name_without_a_text_falls_back_in_the_same_way) {
    serve({"/a", "/b"});
    platform_.setPathAnswers({false, true});
    const std::vector<Value> useless = {Value::nullOf(CMPI_string), Value::missing(CMPI_string),
                                        Value::withoutHandle(CMPI_string)};
    for (const Value& name : useless) {
        platform_.forget();
        expectOk(getInstance({{"Name", name}}));
        EXPECT_THAT(returned("Name"), ElementsAre(serviceName("/b")));
    }
}

} // namespace
} // namespace qelo::test
