// Getting one instance of an association.
#include "AssociationFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;

constexpr const char* operation = "GetInstance";

class AssociationGet : public AssociationFixture {
protected:
    // The keys of the association of these two.
    std::vector<NamedValue> keysOf(const std::string& far, const std::string& near) {
        return {{case_.farRole, Value::ref(broker_.inspect(farPath(far)))},
                {case_.nearRole, Value::ref(broker_.inspect(nearPath(near)))}};
    }
};

TEST_P(AssociationGet, The_first_whose_path_equals_the_request_is_returned) {
    serveTwoAndThree();
    platform_.setPathAnswers({false, false, false, true, true, true});
    const Outcome outcome = getInstance(keysOf("alpha", "/a"));
    EXPECT_THAT(returnedPairs(), ElementsAre("alpha|" + nearId("/a")));
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociationGet, The_request_is_compared_with_each_instances_own_path_not_strictly) {
    serveTwoAndThree();
    platform_.setPathAnswers({false, true});
    const CMPIObjectPath* request =
        broker_.makePath(requestNameSpace, case_.className, keysOf("zeta", "/b"));
    broker_.run([&](const CMPIContext* context, const CMPIResult* result) {
        return instances_->ft->getInstance(instances_, context, result, request, nullptr);
    });
    const std::vector<PathComparison> comparisons = platform_.pathComparisons();
    ASSERT_EQ(comparisons.size(), 2U) << "it stops at the first match";
    for (const PathComparison& comparison : comparisons) {
        EXPECT_EQ(comparison.wanted, request);
        EXPECT_FALSE(comparison.strict);
    }
    EXPECT_EQ(broker_.callCount("getObjectPath"), 2U);
}

TEST_P(AssociationGet, A_path_that_none_equals_returns_nothing) {
    serveTwoAndThree();
    const Outcome outcome = getInstance(keysOf("omega", "/x"));
    expectNothingReturned();
    EXPECT_EQ(platform_.pathComparisons().size(), 6U);
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociationGet, Without_keys_it_tells_so_and_asks_nobody) {
    serveTwoAndThree();
    expectOk(getInstance({}));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_EQ(broker_.callCount("enumerateInstanceNames"), 0U);
    EXPECT_EQ(platform_.storeCallCount(), 0U);
    expectLines(operation, false, {"At least one key should be passed"});
}

TEST_P(AssociationGet, Keys_that_cannot_be_counted_are_none) {
    serveTwoAndThree();
    broker_.failSlot("getKeyCount", 1, broken_);
    expectOk(getInstance(keysOf("zeta", "/a")));
    expectNothingReturned();
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_P(AssociationGet, The_property_list_goes_to_the_brokers_own_filter) {
    serveTwoAndThree();
    platform_.setPathAnswers({true});
    getInstance(keysOf("zeta", "/a"), {{case_.farRole}});
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre(case_.farRole));
}

TEST_P(AssociationGet, An_instance_whose_path_cannot_be_had_is_passed_over) {
    serveTwoAndThree();
    platform_.setPathAnswers({true});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        platform_.forget();
        broker_.clearFaults();
        broker_.failSlot("getObjectPath", 1, fault);
        expectOk(getInstance(keysOf("zeta", "/a")));
        EXPECT_THAT(returnedPairs(), ElementsAre("zeta|" + nearId("/b")));
    }
}

TEST_P(AssociationGet, An_instance_that_cannot_be_made_is_passed_over) {
    serveTwoAndThree();
    platform_.setPathAnswers({true});
    broker_.failSlot("newInstance", 1, Fault::null());
    expectOk(getInstance(keysOf("zeta", "/a")));
    EXPECT_THAT(returnedPairs(), ElementsAre("zeta|" + nearId("/b")));
}

TEST_P(AssociationGet, A_failed_step_of_the_builder_fails_it) {
    serveTwoAndThree();
    const std::vector<NamedValue> keys = keysOf("zeta", "/a");
    const auto get = [&] { return getInstance(keys); };
    failPathOf(case_.farClass, 1, broken_, get);
    expectBroken(get());
    expectFailedStep(operation, case_.farPathFailed);
    failPathOf(case_.className, 2, broken_, get);
    expectBroken(get());
    expectFailedStep(operation, case_.ownPathFailed);
    broker_.clearFaults();
    platform_.forget();
    broker_.failSlot("enumerateInstanceNames", 1, broken_);
    expectBroken(get());
    expectFailedStep(operation, enumerationFailed);
    expectNothingReturned();
}

TEST_P(AssociationGet, Without_near_objects_it_ends_like_the_builder) {
    serveFar({"zeta"});
    expectOk(getInstance(keysOf("zeta", "/a")));
    expectNothingReturned();
    expectFailedStep(operation,
                     "***Can't get ObjectPaths.                 Exiting EnumerateInstanceNames***");
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationGet);

} // namespace
} // namespace qelo::test
