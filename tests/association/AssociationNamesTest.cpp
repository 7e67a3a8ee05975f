// Enumerating the names of both associations.
#include "AssociationFixture.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

constexpr const char* operation = "EnumInstanceNames";
// 16 blanks within, one fewer than where instances are built.
constexpr const char* nothingNear =
    "***Can't get ObjectPaths.                Exiting EnumerateInstanceNames***";

class AssociationNames : public AssociationFixture {
protected:
    void failPath(const std::string& className, unsigned int k, const Fault& fault) {
        failPathOf(className, k, fault, [&] { enumNames(); });
    }
};

TEST_P(AssociationNames, Two_far_and_three_near_objects_give_six_far_ones_outermost) {
    serveTwoAndThree();
    const Outcome outcome = enumNames();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta", "alpha"}, {"/a", "/b", "/c"})));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_THAT(broker_.traces(), IsEmpty());
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociationNames, A_name_has_class_namespace_host_and_two_references_in_order) {
    platform_.setSystemName("box7");
    classPath_ = broker_.makePath("root/other", case_.className);
    serveFar({"zeta"});
    serveNear({"/a"});
    enumNames();
    const Path path = onlyPath();
    EXPECT_EQ(path.className, case_.className);
    EXPECT_EQ(path.nameSpace, "root/other");
    EXPECT_EQ(path.host, "box7");
    EXPECT_THAT(path.keyNames(), ElementsAre(case_.farRole, case_.nearRole));
    ASSERT_NE(path.key(case_.farRole)->path, nullptr);
    EXPECT_EQ(path.key(case_.farRole)->type, CMPI_ref);
    EXPECT_EQ(path.key(case_.farRole)->path->toString(),
              broker_.inspect(farPath("zeta")).toString())
        << "as the broker yielded it";
    const Path near = *path.key(case_.nearRole)->path;
    EXPECT_EQ(near.className, case_.nearClass);
    EXPECT_EQ(near.nameSpace, "root/other");
    EXPECT_EQ(near.host, "box7");
    EXPECT_EQ(near.keyText(case_.nearKey), nearId("/a"));
}

TEST_P(AssociationNames, The_broker_is_asked_for_the_far_class_in_the_requests_namespace) {
    serveTwoAndThree();
    enumNames();
    EXPECT_THAT(broker_.calls(),
                Contains("enumerateInstanceNames(root/cimv2:" + std::string(case_.farClass) + ")"));
    EXPECT_EQ(broker_.callCount("enumerateInstanceNames"), 1U);
    EXPECT_EQ(broker_.callCount("enumerateInstances"), 0U);
    EXPECT_EQ(broker_.callCount("newInstance"), 0U);
}

TEST_P(AssociationNames, The_store_is_read_once) {
    serveTwoAndThree();
    enumNames();
    EXPECT_EQ(platform_.countStoreCalls("selectNode(40)"), 1U);
}

TEST_P(AssociationNames, Without_a_far_object_there_is_nothing_to_name) {
    serveNear({"/a"});
    const Outcome outcome = enumNames();
    expectNothingReturned();
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociationNames, Far_elements_without_a_value_are_passed_over) {
    serveNear({"/a"});
    Answer<CMPIObjectPath> answer;
    answer.elements = {farPath("zeta"), nullptr, broker_.nullHandlePath(), farPath("alpha")};
    broker_.answerInstanceNames(case_.farClass, answer);
    const Outcome outcome = enumNames();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta", "alpha"}, {"/a"})));
    expectNormalEnd(outcome, operation);
}

// ---- failed steps ----

TEST_P(AssociationNames, The_far_class_path_cannot_be_made) {
    serveTwoAndThree();
    failPath(case_.farClass, 1, broken_);
    expectBroken(enumNames());
    expectNothingReturned();
    EXPECT_EQ(broker_.callCount("enumerateInstanceNames"), 0U);
    expectFailedStep(operation, case_.farPathFailed);
}

TEST_P(AssociationNames, The_broker_fails_to_enumerate) {
    serveTwoAndThree();
    broker_.failSlot("enumerateInstanceNames", 1, broken_);
    expectBroken(enumNames());
    expectNothingReturned();
    expectFailedStep(operation, enumerationFailed);
}

TEST_P(AssociationNames, An_enumeration_that_comes_back_with_an_error_is_not_read) {
    serveNear({"/a"});
    Answer<CMPIObjectPath> answer;
    answer.elements = {farPath("zeta")};
    answer.rc = CMPI_RC_ERR_ACCESS_DENIED;
    answer.message = "no access";
    broker_.answerInstanceNames(case_.farClass, answer);
    expectBroken(enumNames());
    expectNothingReturned();
    expectFailedStep(operation, enumerationFailed);
}

TEST_P(AssociationNames, An_enumeration_that_comes_back_null_is_a_failed_one) {
    serveTwoAndThree();
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        platform_.forget();
        broker_.clearFaults();
        broker_.failSlot("enumerateInstanceNames", 1, fault);
        EXPECT_EQ(enumNames().rc, CMPI_RC_ERR_FAILED);
        expectNothingReturned();
        expectFailedStep(operation, enumerationFailed);
    }
}

TEST_P(AssociationNames, There_are_no_near_objects) {
    serveFar({"zeta", "alpha"});
    expectOk(enumNames());
    expectNothingReturned();
    EXPECT_THAT(broker_.traces(), ElementsAre(case_.nothingNear)) << "after the first far object";
    expectFailedStep(operation, nothingNear);
}

TEST_P(AssociationNames, A_near_path_cannot_be_made) {
    serveTwoAndThree();
    failPath(case_.nearClass, 1, broken_);
    expectFailed(enumNames(), case_.nearPathStatus);
    expectNothingReturned();
    EXPECT_THAT(broker_.traces(), ElementsAre(case_.nearPathFailed));
    expectFailedStep(operation, nothingNear);
}

TEST_P(AssociationNames, The_associations_own_path_cannot_be_made) {
    serveTwoAndThree();
    failPath(case_.className, 1, broken_);
    expectBroken(enumNames());
    expectNothingReturned();
    expectFailedStep(operation, case_.ownNameFailed);
}

TEST_P(AssociationNames, A_later_failure_stops_both_walks) {
    serveTwoAndThree();
    failPath(case_.className, 5, broken_);
    expectBroken(enumNames());
    EXPECT_EQ(broker_.returnedPaths().size(), 4U) << "those before it have been returned";
    expectFailedStep(operation, case_.ownNameFailed);
}

TEST_P(AssociationNames, A_path_without_a_handle_counts_as_none) {
    serveTwoAndThree();
    failPath(case_.className, 1, Fault::nullHandle());
    enumNames();
    expectNothingReturned();
    expectFailedStep(operation, case_.ownNameFailed);
    failPath(case_.farClass, 1, Fault::nullHandle());
    enumNames();
    expectNothingReturned();
    expectFailedStep(operation, case_.farPathFailed);
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationNames);

class ManyAssociationNames : public AssociationFixture {};

TEST_P(ManyAssociationNames, Of_65537_near_objects_one_is_associated) {
    platform_.setRecording(false);
    for (unsigned int i = 0; i < 65537; ++i) {
        serveNear({"/" + std::to_string(1000000 + i)});
    }
    serveFar({"zeta"});
    expectOk(enumNames());
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta"}, {"/1000000"})));
}

// The loop is the same for both; the one suffices.
INSTANTIATE_TEST_SUITE_P(One, ManyAssociationNames, testing::Values(&elementCapabilities()));

} // namespace
} // namespace qelo::test
