// Associators: the objects at the other end of both associations.
#include "AssociationFixture.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAre;

constexpr const char* operation = "Associators";

class Associators : public AssociationFixture {
protected:
    Outcome fromFar(const AssociationFilters& filters, const PropertyNames& properties = {}) {
        return associators(farPath("zeta"), filters, properties);
    }
    Outcome fromNear(const AssociationFilters& filters, const PropertyNames& properties = {}) {
        return associators(nearPath("/a"), filters, properties);
    }

    std::vector<std::string> nearIds(const std::vector<std::string>& paths) const {
        std::vector<std::string> ids;
        for (const std::string& path : paths) {
            ids.push_back(nearId(path));
        }
        return ids;
    }
};

// ---- from a near object: the broker's far instances ----

TEST_P(Associators, From_a_near_object_the_brokers_far_instances_are_returned_in_order) {
    serveTwoAndThree();
    const Outcome outcome = fromNear(along());
    EXPECT_THAT(returned("Name"), ElementsAre("zeta", "alpha"));
    EXPECT_THAT(returned("Status"), ElementsAre("OK", "OK")) << "as the broker yielded them";
    expectNormalEnd(outcome, operation);
}

TEST_P(Associators, The_far_instances_are_asked_for_without_a_property_list) {
    serveTwoAndThree();
    fromNear(along(), {{"Name"}});
    EXPECT_THAT(broker_.calls(), Contains("enumerateInstances(root/cimv2:" +
                                          std::string(case_.farClass) + ",null)"));
    EXPECT_THAT(returned("Status"), ElementsAre("OK", "OK"));
}

TEST_P(Associators, Far_elements_without_a_value_are_passed_over) {
    serveTwoAndThree();
    Answer<CMPIInstance> answer;
    answer.elements = {nullptr,
                       broker_.makeInstance(broker_.inspect(farPath("zeta")), {{"Name", "zeta"}}),
                       broker_.nullHandleInstance()};
    broker_.answerInstances(case_.farClass, answer);
    const Outcome outcome = fromNear(along());
    EXPECT_THAT(returned("Name"), ElementsAre("zeta"));
    expectNormalEnd(outcome, operation);
}

TEST_P(Associators, Without_far_instances_there_is_nothing) {
    serveNear({"/a"});
    const Outcome outcome = fromNear(along());
    expectNothingReturned();
    expectNormalEnd(outcome, operation);
}

// ---- from a far object: the near instances made here ----

TEST_P(Associators, From_a_far_object_the_near_instances_are_returned_in_order) {
    serveTwoAndThree();
    const Outcome outcome = fromFar(along());
    EXPECT_EQ(returned(case_.nearKey), nearIds({"/a", "/b", "/c"}));
    for (const Instance& instance : broker_.returnedInstances()) {
        EXPECT_EQ(instance.path.className, case_.nearClass);
        EXPECT_EQ(instance.path.nameSpace, requestNameSpace);
    }
    expectNormalEnd(outcome, operation);
}

TEST_P(Associators, The_property_list_limits_the_near_instances) {
    broker_.ignorePropertyFilter(true);
    serveNear({"/a"});
    fromFar(along(), std::vector<const char*>{});
    const std::size_t keys = onlyInstance().properties.size();
    fromFar(along(), {{"ElementName"}});
    EXPECT_EQ(onlyInstance().properties.size(), keys + 1);
    EXPECT_EQ(onlyInstance().propertyText("ElementName"), nearId("/a"));
}

TEST_P(Associators, A_near_instance_that_cannot_be_made_is_passed_over) {
    serveTwoAndThree();
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        broker_.clearFaults();
        broker_.failSlot("newInstance", 2, fault);
        expectOk(fromFar(along()));
        EXPECT_EQ(returned(case_.nearKey), nearIds({"/a", "/c"}));
        EXPECT_EQ(broker_.doneCount(), 1);
    }
}

TEST_P(Associators, Without_a_service_node_there_is_nothing) {
    const Outcome outcome = fromFar(along());
    expectNothingReturned();
    expectNormalEnd(outcome, operation);
}

// ---- filters ----

TEST_P(Associators, Roles_are_not_looked_at) {
    serveTwoAndThree();
    expectOk(associators(nearPath("/a"), {case_.className, nullptr, "Nonsense", "Other"}));
    EXPECT_THAT(returned("Name"), ElementsAre("zeta", "alpha"));
    expectOk(associators(farPath("zeta"), {case_.className, nullptr, "Nonsense", "Other"}));
    EXPECT_EQ(broker_.returnedInstances().size(), 3U);
}

TEST_P(Associators, Another_association_class_yields_no_result) {
    serveTwoAndThree();
    for (const char* other : {"ZANTH_Other", "CIM_HostedService", "", "ZANTH_AccountHostedServic",
                              "ZANTH_SimElementCapabilities2"}) {
        for (const CMPIObjectPath* source : {farPath("zeta"), nearPath("/a")}) {
            platform_.forget();
            const Outcome outcome = associators(source, {other, nullptr, nullptr, nullptr});
            expectNothingReturned();
            EXPECT_THAT(messages(4000), ElementsAre("Target Class is empty")) << other;
            expectNormalEnd(outcome, operation);
        }
    }
}

TEST_P(Associators, A_missing_association_class_is_a_mismatch) {
    serveTwoAndThree();
    const Outcome outcome = fromNear({});
    expectNothingReturned();
    EXPECT_THAT(messages(4000), ElementsAre("Target Class is empty"));
    expectNormalEnd(outcome, operation);
}

TEST_P(Associators, The_class_of_the_source_is_compared_exactly) {
    serveTwoAndThree();
    for (const char* other : {"zanth_computersystem", "ZANTH_ACCOUNTMANAGEMENTSERVICE",
                              "CIM_ComputerSystem", "ZANTH_Account", ""}) {
        platform_.forget();
        const Outcome outcome =
            associators(broker_.makePath(requestNameSpace, other, {{"Name", "x"}}), along());
        expectNothingReturned();
        EXPECT_THAT(messages(4000), ElementsAre("Target Class is empty")) << other;
        expectNormalEnd(outcome, operation);
    }
}

TEST_P(Associators, An_empty_result_class_counts_as_not_given) {
    serveTwoAndThree();
    expectOk(fromNear(along("")));
    EXPECT_EQ(broker_.returnedInstances().size(), 2U);
    expectOk(fromFar(along("")));
    EXPECT_EQ(broker_.returnedInstances().size(), 3U);
}

TEST_P(Associators, The_result_class_itself_is_admitted) {
    serveTwoAndThree();
    expectOk(fromNear(along(case_.farClass)));
    EXPECT_EQ(broker_.returnedInstances().size(), 2U);
    expectOk(fromFar(along(case_.nearClass)));
    EXPECT_EQ(broker_.returnedInstances().size(), 3U);
}

TEST_P(Associators, The_broker_fails_to_enumerate) {
    serveTwoAndThree();
    broker_.failSlot("enumerateInstances", 1, broken_);
    expectBroken(fromNear(along()));
    expectNothingReturned();
    expectFailedStep(operation, enumerationFailed);
}

TEST_P(Associators, An_enumeration_that_comes_back_null_is_a_failed_one) {
    serveTwoAndThree();
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        platform_.forget();
        broker_.clearFaults();
        broker_.failSlot("enumerateInstances", 1, fault);
        EXPECT_EQ(fromNear(along()).rc, CMPI_RC_ERR_FAILED);
        expectNothingReturned();
        expectFailedStep(operation, enumerationFailed);
    }
}

TEST_P(Associators, There_is_no_target_path) {
    serveTwoAndThree();
    broker_.failSlot("newObjectPath", 1, broken_);
    expectBroken(fromNear(along()));
    expectNothingReturned();
    expectFailedStep(operation, "Object Path is NULL in Associators.");
    platform_.forget();
    broker_.clearFaults();
    broker_.failSlot("newObjectPath", 1, Fault::nullHandle());
    fromFar(along());
    expectNothingReturned();
    expectFailedStep(operation, "Object Path is NULL in Associators.");
}

QELO_FOR_BOTH_ASSOCIATIONS(Associators);

// ---- the result class of the hosted-service association ----

class HostedServiceAssociators : public Associators {};

TEST_P(HostedServiceAssociators, CIM_ComputerSystem_in_any_letter_case_returns_the_systems) {
    serveTwoAndThree();
    for (const char* name :
         {"CIM_ComputerSystem", "cim_computersystem", "CIM_COMPUTERSYSTEM", "cIm_CoMpUtErSyStEm",
          "zanth_computersystem", "ZANTH_COMPUTERSYSTEM"}) {
        expectOk(fromNear(along(name)));
        EXPECT_THAT(returned("Name"), ElementsAre("zeta", "alpha")) << name;
        EXPECT_EQ(broker_.doneCount(), 1);
    }
}

TEST_P(HostedServiceAssociators, CIM_AccountManagementService_in_any_letter_case_returns_services) {
    serveTwoAndThree();
    for (const char* name : {"CIM_AccountManagementService", "cim_accountmanagementservice",
                             "ZANTH_ACCOUNTMANAGEMENTSERVICE"}) {
        expectOk(fromFar(along(name)));
        EXPECT_EQ(broker_.returnedInstances().size(), 3U) << name;
        EXPECT_EQ(broker_.doneCount(), 1);
    }
}

TEST_P(HostedServiceAssociators, Any_other_result_class_returns_nothing_and_succeeds) {
    serveTwoAndThree();
    for (const char* name : {"CIM_System", "CIM_ManagedElement", "ZANTH_Account", "x"}) {
        for (const CMPIObjectPath* source : {farPath("zeta"), nearPath("/a")}) {
            platform_.forget();
            const Outcome outcome = associators(source, along(name));
            expectNothingReturned();
            expectNormalEnd(outcome, operation);
        }
    }
}

TEST_P(HostedServiceAssociators, The_class_of_the_wrong_end_returns_nothing) {
    serveTwoAndThree();
    for (const char* name : {"ZANTH_AccountManagementService", "CIM_AccountManagementService"}) {
        expectOk(fromNear(along(name)));
        expectNothingReturned();
    }
    for (const char* name : {"ZANTH_ComputerSystem", "CIM_ComputerSystem"}) {
        expectOk(fromFar(along(name)));
        expectNothingReturned();
    }
}

TEST_P(HostedServiceAssociators, A_refused_result_class_asks_the_broker_nothing) {
    serveTwoAndThree();
    fromNear(along("CIM_System"));
    EXPECT_EQ(broker_.callCount("enumerateInstances"), 0U);
}

INSTANTIATE_TEST_SUITE_P(Hosted, HostedServiceAssociators, testing::Values(&hostedService()));

// ---- the element-capabilities association looks at no result class ----

class ElementCapabilitiesAssociators : public Associators {};

TEST_P(ElementCapabilitiesAssociators, Any_result_class_whatever_yields_the_results) {
    serveTwoAndThree();
    for (const char* name : {"ZANTH_Account", "CIM_ComputerSystem", "no such class", "x",
                             "ZANTH_AccountManagementService"}) {
        expectOk(fromNear(along(name)));
        EXPECT_THAT(returned("Name"), ElementsAre("zeta", "alpha")) << name;
        expectOk(fromFar(along(name)));
        EXPECT_EQ(broker_.returnedInstances().size(), 3U) << name;
    }
}

INSTANTIATE_TEST_SUITE_P(Element, ElementCapabilitiesAssociators,
                         testing::Values(&elementCapabilities()));

} // namespace
} // namespace qelo::test
