// The order of what association requests do at the broker and leave in the log.
#include "AssociationFixture.h"

#include "support/operations/Events.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAreArray;

class AssociationOrder : public AssociationFixture {
protected:
    struct Request {
        std::string operation;
        std::function<Outcome()> run;
    };

    // Those that keep a factory of their own to the end, from each end of the association.
    const std::vector<Request> withFactory_ = {
        {"EnumInstanceNames", [&] { return enumNames(); }},
        {"Associators", [&] { return associators(farPath("zeta"), along()); }},
        {"Associators", [&] { return associators(nearPath("/a"), along()); }},
        {"AssociatorNames", [&] { return associatorNames(farPath("zeta"), along()); }},
        {"AssociatorNames", [&] { return associatorNames(nearPath("/a"), along()); }},
        {"References", [&] { return references(farPath("zeta")); }},
        {"ReferenceNames", [&] { return referenceNames(farPath("zeta")); }},
    };
    // Those that leave the factory to the builder of the instances.
    const std::vector<Request> withBuilder_ = {
        {"EnumInstances", [&] { return enumInstances(); }},
        {"GetInstance",
         [&] {
             return getInstance({{case_.farRole, "x"}});
         }},
    };
    const std::vector<Request> references_ = {
        {"References", [&] { return references(nearPath("/a")); }},
        {"ReferenceNames", [&] { return referenceNames(nearPath("/a")); }},
    };

    Events end(const std::string& operation) const {
        return joined({{"broker: returnDone"},
                       exitMarker(case_.provider.file, case_.prefix + ("_" + operation))});
    }

    // The line with which the near factory ends.
    std::string factoryGone() const {
        const bool services = &case_ == &hostedService();
        return services ? destructorLine("SimAccountManagementServiceObjFactory",
                                         "SimAccountManagementServiceFactory")
                        : destructorLine("SimAccountManagementCapabilitiesObjFactory",
                                         "SimAccountManagementCapabilitiesFactory");
    }

    static std::string newPathCall(const std::string& className) {
        return "newObjectPath(root/cimv2," + className + ")";
    }
};

TEST_P(AssociationOrder, The_factory_goes_after_CMReturnDone_and_the_exit_marker) {
    serveTwoAndThree();
    for (const Request& request : withFactory_) {
        SCOPED_TRACE(request.operation);
        platform_.forget();
        expectOk(request.run());
        EXPECT_THAT(eventsFromLast("broker: returnDone"),
                    ElementsAreArray(joined({end(request.operation), {factoryGone()}})));
    }
}

TEST_P(AssociationOrder, The_builders_factory_goes_before_anything_is_returned) {
    serveTwoAndThree();
    for (const Request& request : withBuilder_) {
        SCOPED_TRACE(request.operation);
        platform_.forget();
        platform_.setPathAnswers({true});
        expectOk(request.run());
        EXPECT_THAT(eventsFromLast("broker: returnDone"), ElementsAreArray(end(request.operation)));
        EXPECT_THAT(eventsFromLast(factoryGone()), Contains("broker: returnInstance"));
    }
}

TEST_P(AssociationOrder, The_far_class_is_enumerated_on_a_path_made_and_not_placed) {
    serveTwoAndThree();
    for (const Request& request : {withFactory_[0], withBuilder_[0]}) {
        SCOPED_TRACE(request.operation);
        platform_.forget();
        expectOk(request.run());
        const Events events = eventsFromLast("broker: " + newPathCall(case_.farClass));
        ASSERT_GT(events.size(), 1U);
        EXPECT_EQ(events[1],
                  "broker: enumerateInstanceNames(root/cimv2:" + std::string(case_.farClass) + ")");
    }
}

TEST_P(AssociationOrder, A_target_path_is_made_and_placed) {
    serveTwoAndThree();
    expectOk(associators(nearPath("/a"), along()));
    EXPECT_THAT(lastOf(eventsWithin("get_assoc_targetClass_ObjectPath"), 8),
                ElementsAreArray(placedPath(case_.farClass)));
}

TEST_P(AssociationOrder, References_make_their_own_path_right_after_the_target) {
    serveTwoAndThree();
    for (const Request& request : references_) {
        SCOPED_TRACE(request.operation);
        platform_.forget();
        expectOk(request.run());
        const std::string targetMade =
            "EXITING: get_assoc_targetClass_ObjectPath() in " + std::string(case_.factory.file);
        Events events = normalisedEvents();
        const auto made = std::find_if(events.begin(), events.end(), [&](const std::string& event) {
            return event.find(targetMade) == 0;
        });
        ASSERT_GT(events.end() - made, 9);
        EXPECT_THAT(Events(made + 1, made + 9), ElementsAreArray(placedPath(case_.className)));
    }
}

TEST_P(AssociationOrder, References_without_a_target_have_made_their_own_path_all_the_same) {
    serveTwoAndThree();
    for (const Request& request : references_) {
        SCOPED_TRACE(request.operation);
        platform_.forget();
        broker_.failSlot("newObjectPath", 1, broken_);
        const Outcome outcome = request.run();
        EXPECT_EQ(outcome.rc, CMPI_RC_OK) << "the status of the last path made";
        EXPECT_THAT(broker_.calls(), Contains(newPathCall(case_.className)));
        EXPECT_THAT(
            lastOf(normalisedEvents(), 1),
            ElementsAreArray({"MESSAGE [File: " + std::string(case_.provider.file) +
                              ", Line: #]: Object Path is NULL in " + request.operation + "."}));
    }
}

QELO_FOR_BOTH_ASSOCIATIONS(AssociationOrder);

} // namespace
} // namespace qelo::test
