// References and ReferenceNames: the associations that touch an object.
#include "AssociationFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

// 17 blanks within; the names operation uses this text too.
constexpr const char* nothingNear = "***Can't get instances                 Exiting References***";

class References : public AssociationFixture {
protected:
    Outcome fromFar(const char* resultClass = nullptr) {
        return references(farPath("alpha"), resultClass);
    }
    Outcome fromNear(const char* resultClass = nullptr) {
        return references(nearPath("/b"), resultClass);
    }
};

TEST_P(References, From_a_far_object_there_is_one_for_each_near_object) {
    serveTwoAndThree();
    const Outcome outcome = fromFar();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"alpha"}, {"/a", "/b", "/c"})));
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
    expectNormalEnd(outcome, "References");
}

TEST_P(References, The_near_objects_are_not_counted_beforehand) {
    serveTwoAndThree();
    fromFar();
    EXPECT_THAT(pointsIn("getNumberOfInstances"), IsEmpty());
    associatorNames(farPath("alpha"), along());
    EXPECT_THAT(pointsIn("getNumberOfInstances"), testing::Not(IsEmpty()));
}

TEST_P(References, From_a_near_object_there_is_one_for_each_far_object) {
    serveTwoAndThree();
    const Outcome outcome = fromNear();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta", "alpha"}, {"/b"})));
    expectNormalEnd(outcome, "References");
}

TEST_P(References, The_end_that_was_asked_about_is_the_requests_own_path) {
    serveTwoAndThree();
    fromFar();
    for (const Instance& instance : broker_.returnedInstances()) {
        EXPECT_EQ(instance.property(case_.farRole)->path->toString(),
                  broker_.inspect(farPath("alpha")).toString());
    }
    fromNear();
    for (const Instance& instance : broker_.returnedInstances()) {
        EXPECT_EQ(instance.property(case_.nearRole)->path->toString(),
                  broker_.inspect(nearPath("/b")).toString());
    }
}

TEST_P(References, An_instance_has_its_own_path_and_two_references) {
    serveTwoAndThree();
    for (const CMPIObjectPath* source : {farPath("alpha"), nearPath("/b")}) {
        references(source);
        for (const Instance& instance : broker_.returnedInstances()) {
            EXPECT_EQ(instance.path.className, case_.className);
            EXPECT_EQ(instance.path.nameSpace, requestNameSpace);
            EXPECT_THAT(instance.propertyNames(), ElementsAre(case_.farRole, case_.nearRole));
            EXPECT_EQ(instance.property(case_.farRole)->type, CMPI_ref);
            EXPECT_EQ(instance.property(case_.nearRole)->type, CMPI_ref);
        }
    }
}

TEST_P(References, A_near_object_is_placed_in_the_namespace_of_the_request_on_this_system) {
    platform_.setSystemName("box7");
    serveTwoAndThree();
    references(broker_.makePath("root/other", case_.farClass, {{"Name", "alpha"}}));
    ASSERT_EQ(broker_.returnedInstances().size(), 3U);
    const Path near = *broker_.returnedInstances()[0].property(case_.nearRole)->path;
    EXPECT_EQ(near.nameSpace, "root/other");
    EXPECT_EQ(near.host, "box7");
    EXPECT_EQ(near.className, case_.nearClass);
}

TEST_P(References, No_filter_but_the_class_of_the_source_is_looked_at) {
    serveTwoAndThree();
    for (const char* name : {"", "ZANTH_Other", "CIM_System", "ZANTH_AccountHostedService"}) {
        expectOk(fromFar(name));
        EXPECT_EQ(broker_.returnedInstances().size(), 3U) << name;
        expectOk(fromNear(name));
        EXPECT_EQ(broker_.returnedInstances().size(), 2U) << name;
    }
}

TEST_P(References, Another_source_class_has_none) {
    serveTwoAndThree();
    for (const char* name : {"ZANTH_Account", "zanth_accountmanagementservice", ""}) {
        platform_.forget();
        const Outcome outcome = references(broker_.makePath(requestNameSpace, name));
        expectNothingReturned();
        EXPECT_THAT(messages(4000), ElementsAre("Target Class is empty")) << name;
        expectNormalEnd(outcome, "References");
    }
}

TEST_P(References, The_far_class_is_enumerated_by_name_with_the_requests_context) {
    serveTwoAndThree();
    fromNear();
    EXPECT_THAT(broker_.calls(), testing::Contains("enumerateInstanceNames(root/cimv2:" +
                                                   std::string(case_.farClass) + ")"));
    EXPECT_EQ(broker_.callCount("enumerateInstances"), 0U);
}

TEST_P(References, An_instance_that_cannot_be_made_is_passed_over) {
    serveTwoAndThree();
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        broker_.clearFaults();
        broker_.failSlot("newInstance", 2, fault);
        expectOk(fromFar());
        EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"alpha"}, {"/a", "/c"})));
        expectOk(fromNear());
        EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta"}, {"/b"})));
    }
}

TEST_P(References, Far_elements_without_a_value_are_passed_over) {
    Answer<CMPIObjectPath> answer;
    answer.elements = {nullptr, broker_.nullHandlePath(), farPath("zeta")};
    broker_.answerInstanceNames(case_.farClass, answer);
    const Outcome outcome = fromNear();
    EXPECT_THAT(returnedPairs(), ElementsAreArray(pairs({"zeta"}, {"/b"})));
    expectNormalEnd(outcome, "References");
}

// ---- the names operation ----

TEST_P(References, Names_are_the_instances_own_paths) {
    serveTwoAndThree();
    expectOk(referenceNames(farPath("alpha")));
    EXPECT_EQ(broker_.returnedPaths().size(), 3U);
    EXPECT_EQ(broker_.callCount("getObjectPath"), 3U);
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    for (const Path& path : broker_.returnedPaths()) {
        EXPECT_EQ(path.className, case_.className);
        EXPECT_EQ(path.nameSpace, requestNameSpace);
    }
    expectLines("ReferenceNames", true);
    platform_.forget();
    const Outcome outcome = referenceNames(nearPath("/b"));
    EXPECT_EQ(broker_.returnedPaths().size(), 2U);
    EXPECT_EQ(broker_.callCount("newInstance"), 2U);
    expectNormalEnd(outcome, "ReferenceNames");
}

TEST_P(References, Names_are_made_from_instances_that_hold_both_references) {
    serveTwoAndThree();
    referenceNames(nearPath("/b"));
    unsigned int referencesSet = 0;
    for (const std::string& call : broker_.calls()) {
        referencesSet += call.find("setProperty(" + std::string(case_.farRole) + ",ref,") == 0;
        referencesSet += call.find("setProperty(" + std::string(case_.nearRole) + ",ref,") == 0;
    }
    EXPECT_EQ(referencesSet, 4U);
}

TEST_P(References, A_name_that_cannot_be_had_is_passed_over) {
    serveTwoAndThree();
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        broker_.clearFaults();
        broker_.failSlot("getObjectPath", 1, fault);
        expectOk(referenceNames(farPath("alpha")));
        EXPECT_EQ(broker_.returnedPaths().size(), 2U);
        EXPECT_EQ(broker_.doneCount(), 1);
    }
}

TEST_P(References, Names_look_at_no_result_class_either) {
    serveTwoAndThree();
    expectOk(referenceNames(farPath("alpha"), "ZANTH_Other"));
    EXPECT_EQ(broker_.returnedPaths().size(), 3U);
}

TEST_P(References, Another_source_class_has_no_names) {
    serveTwoAndThree();
    const Outcome outcome = referenceNames(broker_.makePath(requestNameSpace, "ZANTH_Account"));
    expectNothingReturned();
    expectNormalEnd(outcome, "ReferenceNames");
}

QELO_FOR_BOTH_ASSOCIATIONS(References);

// ---- failed steps, of both operations ----

struct Direction {
    const char* operation;
    const char* noTarget;
};

class FailedReferences : public AssociationFixture {
protected:
    // Runs `check` for both operations, each with its name and its text for a missing target.
    void forBoth(const std::function<void(bool, const Direction&)>& check) {
        const Direction directions[] = {
            {"References", "Object Path is NULL in References."},
            {"ReferenceNames", "Object Path is NULL in ReferenceNames."}};
        for (const bool names : {false, true}) {
            SCOPED_TRACE(directions[names ? 1 : 0].operation);
            platform_.forget();
            check(names, directions[names ? 1 : 0]);
            broker_.clearFaults();
        }
    }

    Outcome run(bool names, const CMPIObjectPath* source) {
        return names ? referenceNames(source) : references(source);
    }
};

TEST_P(FailedReferences, There_is_no_target_path) {
    serveTwoAndThree();
    forBoth([&](bool names, const Direction& direction) {
        broker_.failSlot("newObjectPath", 0, broken_);
        expectBroken(run(names, nearPath("/b")));
        expectNothingReturned();
        expectFailedStep(direction.operation, direction.noTarget);
    });
}

TEST_P(FailedReferences, The_broker_fails_to_enumerate) {
    serveTwoAndThree();
    forBoth([&](bool names, const Direction& direction) {
        broker_.failSlot("enumerateInstanceNames", 1, broken_);
        expectBroken(run(names, nearPath("/b")));
        expectNothingReturned();
        expectFailedStep(direction.operation, enumerationFailed);
    });
}

TEST_P(FailedReferences, An_enumeration_that_comes_back_null_is_a_failed_one) {
    serveTwoAndThree();
    forBoth([&](bool names, const Direction& direction) {
        broker_.failSlot("enumerateInstanceNames", 1, Fault::null());
        EXPECT_EQ(run(names, nearPath("/b")).rc, CMPI_RC_ERR_FAILED);
        expectNothingReturned();
        expectFailedStep(direction.operation, enumerationFailed);
    });
}

TEST_P(FailedReferences, There_are_no_near_objects) {
    forBoth([&](bool names, const Direction& direction) {
        expectOk(run(names, farPath("alpha")));
        expectNothingReturned();
        EXPECT_THAT(broker_.traces(), ElementsAre(case_.nothingNear));
        expectFailedStep(direction.operation, nothingNear);
    });
}

TEST_P(FailedReferences, A_near_path_cannot_be_made) {
    serveTwoAndThree();
    forBoth([&](bool names, const Direction& direction) {
        failPathOf(case_.nearClass, 2, broken_, [&] { run(names, farPath("alpha")); });
        expectFailed(run(names, farPath("alpha")), case_.nearPathStatus);
        expectNothingReturned();
        EXPECT_THAT(broker_.traces(), ElementsAre(case_.nearPathFailed));
        expectFailedStep(direction.operation, nothingNear);
    });
}

TEST_P(FailedReferences, The_associations_own_path_cannot_be_made) {
    serveTwoAndThree();
    forBoth([&](bool names, const Direction& direction) {
        failPathOf(case_.className, 1, broken_, [&] { run(names, nearPath("/b")); });
        run(names, nearPath("/b"));
        expectNothingReturned();
        EXPECT_EQ(broker_.callCount("newInstance"), 0U) << direction.operation;
    });
}

QELO_FOR_BOTH_ASSOCIATIONS(FailedReferences);

} // namespace
} // namespace qelo::test
