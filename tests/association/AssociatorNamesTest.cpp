// AssociatorNames: the paths of the objects at the other end of both associations.
#include "AssociationFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* operation = "AssociatorNames";
// 21 blanks within.
constexpr const char* nothingNear =
    "***Can't get Service processor ObjectPaths.                     Exiting AssociatorNames***";

class AssociatorNames : public AssociationFixture {
protected:
    Outcome fromFar(const AssociationFilters& filters) {
        return associatorNames(farPath("zeta"), filters);
    }
    Outcome fromNear(const AssociationFilters& filters) {
        return associatorNames(nearPath("/a"), filters);
    }
};

TEST_P(AssociatorNames, From_a_near_object_the_brokers_far_paths_are_returned_in_order) {
    serveTwoAndThree();
    const Outcome outcome = fromNear(along());
    EXPECT_THAT(returned("Name"), ElementsAre("zeta", "alpha"));
    EXPECT_EQ(broker_.returnedPaths()[0].toString(), broker_.inspect(farPath("zeta")).toString());
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociatorNames, From_a_far_object_the_near_paths_are_returned_in_order) {
    serveTwoAndThree();
    const Outcome outcome = fromFar(along());
    EXPECT_THAT(returned(case_.nearKey), ElementsAre(nearId("/a"), nearId("/b"), nearId("/c")));
    for (const Path& path : broker_.returnedPaths()) {
        EXPECT_EQ(path.className, case_.nearClass);
        EXPECT_EQ(path.nameSpace, requestNameSpace);
        EXPECT_EQ(path.host, "host.example");
    }
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociatorNames, Far_elements_without_a_value_are_passed_over) {
    Answer<CMPIObjectPath> answer;
    answer.elements = {broker_.nullHandlePath(), farPath("zeta"), nullptr};
    broker_.answerInstanceNames(case_.farClass, answer);
    const Outcome outcome = fromNear(along());
    EXPECT_THAT(returned("Name"), ElementsAre("zeta"));
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociatorNames, Another_or_no_association_class_yields_no_result) {
    serveTwoAndThree();
    for (const char* other : {static_cast<const char*>(nullptr), "", "ZANTH_Other"}) {
        for (const CMPIObjectPath* source : {farPath("zeta"), nearPath("/a")}) {
            platform_.forget();
            const Outcome outcome = associatorNames(source, {other, nullptr, nullptr, nullptr});
            expectNothingReturned();
            EXPECT_THAT(messages(4000), ElementsAre("Target Class is empty"));
            expectNormalEnd(outcome, operation);
        }
    }
}

TEST_P(AssociatorNames, The_class_of_the_source_is_compared_exactly) {
    serveTwoAndThree();
    const Outcome outcome = associatorNames(
        broker_.makePath(requestNameSpace, "zanth_accountmanagementservice"), along());
    expectNothingReturned();
    expectNormalEnd(outcome, operation);
}

TEST_P(AssociatorNames, Roles_are_not_looked_at) {
    serveTwoAndThree();
    expectOk(associatorNames(nearPath("/a"), {case_.className, nullptr, "Nonsense", "Other"}));
    EXPECT_EQ(broker_.returnedPaths().size(), 2U);
}

TEST_P(AssociatorNames, The_classes_of_the_ends_and_an_empty_text_are_admitted) {
    serveTwoAndThree();
    for (const char* name : {case_.farClass, ""}) {
        expectOk(fromNear(along(name)));
        EXPECT_EQ(broker_.returnedPaths().size(), 2U);
    }
    for (const char* name : {case_.nearClass, ""}) {
        expectOk(fromFar(along(name)));
        EXPECT_EQ(broker_.returnedPaths().size(), 3U);
    }
}

// ---- failed steps ----

TEST_P(AssociatorNames, There_is_no_target_path) {
    serveTwoAndThree();
    for (const CMPIObjectPath* source : {farPath("zeta"), nearPath("/a")}) {
        platform_.forget();
        broker_.failSlot("newObjectPath", 1, broken_);
        expectBroken(associatorNames(source, along()));
        expectNothingReturned();
        expectFailedStep(operation, "Object Path is NULL in AssociatorNames.");
    }
}

TEST_P(AssociatorNames, The_broker_fails_to_enumerate) {
    serveTwoAndThree();
    broker_.failSlot("enumerateInstanceNames", 1, broken_);
    expectBroken(fromNear(along()));
    expectNothingReturned();
    expectFailedStep(operation, enumerationFailed);
}

TEST_P(AssociatorNames, An_enumeration_that_comes_back_null_is_a_failed_one) {
    serveTwoAndThree();
    broker_.failSlot("enumerateInstanceNames", 1, Fault::null());
    EXPECT_EQ(fromNear(along()).rc, CMPI_RC_ERR_FAILED);
    expectFailedStep(operation, enumerationFailed);
}

TEST_P(AssociatorNames, There_are_no_near_objects) {
    serveFar({"zeta"});
    expectOk(fromFar(along()));
    expectNothingReturned();
    EXPECT_THAT(broker_.traces(), ElementsAre(case_.nothingNear));
    expectFailedStep(operation, nothingNear);
}

TEST_P(AssociatorNames, A_near_path_cannot_be_made) {
    serveTwoAndThree();
    broker_.failSlot("newObjectPath", 3, broken_);
    expectFailed(fromFar(along()), case_.nearPathStatus);
    expectNothingReturned();
    EXPECT_THAT(broker_.traces(), ElementsAre(case_.nearPathFailed));
    expectFailedStep(operation, nothingNear);
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociatorNames);

// ---- result classes ----

class HostedServiceNames : public AssociatorNames {};

TEST_P(HostedServiceNames, Parents_in_any_letter_case_are_admitted) {
    serveTwoAndThree();
    for (const char* name : {"CIM_ComputerSystem", "cim_COMPUTERsystem", "zanth_computersystem"}) {
        expectOk(fromNear(along(name)));
        EXPECT_EQ(broker_.returnedPaths().size(), 2U) << name;
    }
    for (const char* name : {"CIM_AccountManagementService", "cim_ACCOUNTmanagementservice",
                             "zanth_accountmanagementSERVICE"}) {
        expectOk(fromFar(along(name)));
        EXPECT_EQ(broker_.returnedPaths().size(), 3U) << name;
    }
}

TEST_P(HostedServiceNames, Any_other_result_class_returns_nothing_and_succeeds) {
    serveTwoAndThree();
    for (const char* name : {"CIM_System", "ZANTH_AccountHostedService", "x"}) {
        for (const CMPIObjectPath* source : {farPath("zeta"), nearPath("/a")}) {
            platform_.forget();
            const Outcome outcome = associatorNames(source, along(name));
            expectNothingReturned();
            EXPECT_EQ(broker_.callCount("enumerateInstanceNames"), 0U);
            expectNormalEnd(outcome, operation);
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Hosted, HostedServiceNames, testing::Values(&hostedService()));

} // namespace
} // namespace qelo::test
