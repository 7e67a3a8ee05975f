// Enumerating the instances of both associations.
#include "AssociationFixture.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* operation = "EnumInstances";
// 17 blanks within.
constexpr const char* nothingNear =
    "***Can't get ObjectPaths.                 Exiting EnumerateInstanceNames***";

class AssociationInstances : public AssociationFixture {
protected:
    void failPath(const std::string& className, unsigned int k, const Fault& fault) {
        failPathOf(className, k, fault, [&] { enumInstances(); });
    }
};

TEST_P(AssociationInstances, Two_far_and_three_near_objects_give_six_far_ones_outermost) {
    serveTwoAndThree();
    const Outcome outcome = enumInstances();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta", "alpha"}, {"/a", "/b", "/c"})));
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociationInstances, Two_far_objects_and_one_near_give_two_in_the_brokers_order) {
    serveFar({"zeta", "alpha"});
    serveNear({"/a"});
    enumInstances();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta", "alpha"}, {"/a"})));
}

TEST_P(AssociationInstances, N_nodes_give_N_times_N_associations) {
    const std::vector<std::string> nodes = {"/a", "/b", "/c", "/d"};
    serveNear(nodes);
    serveFar(nodes);
    enumInstances();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs(nodes, nodes)));
}

TEST_P(AssociationInstances, An_instance_has_its_own_path_and_two_references_in_order) {
    platform_.setSystemName("box7");
    classPath_ = broker_.makePath("root/other", case_.className);
    serveFar({"zeta"});
    serveNear({"/a"});
    enumInstances();
    const Instance instance = onlyInstance();
    EXPECT_EQ(instance.path.toString(), "//box7/root/other:" + std::string(case_.className));
    EXPECT_THAT(instance.propertyNames(), ElementsAre(case_.farRole, case_.nearRole));
    EXPECT_EQ(instance.property(case_.farRole)->type, CMPI_ref);
    EXPECT_EQ(instance.property(case_.nearRole)->type, CMPI_ref);
    EXPECT_EQ(instance.property(case_.farRole)->path->toString(),
              broker_.inspect(farPath("zeta")).toString());
    EXPECT_EQ(instance.property(case_.nearRole)->path->className, case_.nearClass);
}

TEST_P(AssociationInstances, The_property_list_goes_to_the_brokers_own_filter) {
    serveFar({"zeta"});
    serveNear({"/a"});
    enumInstances({{case_.nearRole}});
    EXPECT_THAT(broker_.calls(),
                Contains(HasSubstr("setPropertyFilter({" + std::string(case_.nearRole) + "},")));
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre(case_.nearRole));
    enumInstances();
    EXPECT_THAT(broker_.calls(), Contains(HasSubstr("setPropertyFilter(null,")));
}

TEST_P(AssociationInstances, The_store_is_read_once) {
    serveTwoAndThree();
    enumInstances();
    EXPECT_EQ(platform_.countStoreCalls("selectNode(40)"), 1U);
}

TEST_P(AssociationInstances, Without_a_far_object_there_are_none) {
    const Outcome outcome = enumInstances();
    expectNothingReturned();
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociationInstances, An_instance_that_cannot_be_made_is_passed_over) {
    serveTwoAndThree();
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), broken_}) {
        for (const unsigned int nth : {2U, 6U}) {
            platform_.forget();
            broker_.clearFaults();
            broker_.failSlot("newInstance", nth, fault);
            const Outcome outcome = enumInstances();
            std::vector<std::string> expected = pairs({"zeta", "alpha"}, {"/a", "/b", "/c"});
            expected.erase(expected.begin() + static_cast<std::ptrdiff_t>(nth) - 1);
            EXPECT_THAT(returnedPairs(), ElementsAreArray(expected));
            expectNormalEnd(outcome, operation);
        }
    }
}

TEST_P(AssociationInstances, Far_elements_without_a_value_are_passed_over) {
    serveNear({"/a"});
    Answer<CMPIObjectPath> answer;
    answer.elements = {nullptr, farPath("zeta"), broker_.nullHandlePath()};
    broker_.answerInstanceNames(case_.farClass, answer);
    const Outcome outcome = enumInstances();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta"}, {"/a"})));
    expectNormalEnd(outcome, operation);
}

// ---- failed steps: nothing of what was built is returned ----

TEST_P(AssociationInstances, The_far_class_path_cannot_be_made) {
    serveTwoAndThree();
    failPath(case_.farClass, 1, broken_);
    expectBroken(enumInstances());
    expectNothingReturned();
    expectFailedStep(operation, case_.farPathFailed);
}

TEST_P(AssociationInstances, The_broker_fails_to_enumerate) {
    serveTwoAndThree();
    broker_.failSlot("enumerateInstanceNames", 1, broken_);
    expectBroken(enumInstances());
    expectNothingReturned();
    expectFailedStep(operation, enumerationFailed);
}

TEST_P(AssociationInstances, An_enumeration_that_comes_back_null_is_a_failed_one) {
    serveTwoAndThree();
    broker_.failSlot("enumerateInstanceNames", 1, Fault::null());
    EXPECT_EQ(enumInstances().rc, CMPI_RC_ERR_FAILED);
    expectNothingReturned();
    expectFailedStep(operation, enumerationFailed);
}

TEST_P(AssociationInstances, There_are_no_near_objects) {
    serveFar({"zeta", "alpha"});
    expectOk(enumInstances());
    expectNothingReturned();
    EXPECT_THAT(broker_.traces(), ElementsAre(case_.nothingNear));
    expectFailedStep(operation, nothingNear);
}

TEST_P(AssociationInstances, A_near_path_cannot_be_made) {
    serveTwoAndThree();
    failPath(case_.nearClass, 5, broken_);
    expectFailed(enumInstances(), case_.nearPathStatus);
    expectNothingReturned();
    EXPECT_THAT(broker_.traces(), ElementsAre(case_.nearPathFailed));
    expectFailedStep(operation, nothingNear);
}

TEST_P(AssociationInstances, The_associations_own_path_cannot_be_made) {
    serveTwoAndThree();
    failPath(case_.className, 1, broken_);
    expectBroken(enumInstances());
    expectNothingReturned();
    expectFailedStep(operation, case_.ownPathFailed);
}

TEST_P(AssociationInstances, A_later_failure_returns_nothing_of_what_was_built) {
    serveTwoAndThree();
    failPath(case_.className, 5, broken_);
    expectBroken(enumInstances());
    expectNothingReturned();
    expectFailedStep(operation, case_.ownPathFailed);
}

TEST_P(AssociationInstances, Without_a_broker_nothing_is_asked_or_returned) {
    serveTwoAndThree();
    registerBroker(nullptr);
    enumInstances();
    expectNothingReturned();
    expectFailedStep(operation, case_.farPathFailed);
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationInstances);

} // namespace
} // namespace qelo::test
