// The order of what identity requests do at the broker and leave in the log.
#include "IdentityFixture.h"

#include "support/operations/Events.h"

namespace qelo::test {
namespace {

using testing::ElementsAreArray;
using testing::StartsWith;

constexpr const char* key = "(InstanceID,chars,\"ZANTH:SimIdentity1\")";

class IdentityOrder : public IdentityFixture {
protected:
    static void expectEnd(const std::string& operation) {
        const Events events = eventsFromLast("broker: returnDone");
        ASSERT_EQ(events.size(), 3U);
        EXPECT_THAT(events[1], StartsWith("EXITING: SimIdentity_" + operation + "() in "));
        EXPECT_EQ(events[2], destructorLine("SimIdentityObjFactory", "SimIdentityFactory"));
    }
};

TEST_F(IdentityOrder, The_factory_goes_after_CMReturnDone_and_the_exit_line) {
    enumNames();
    expectEnd("EnumInstanceNames");
    enumInstances();
    expectEnd("EnumInstances");
    getInstance({{"InstanceID", "ZANTH:SimIdentity1"}});
    expectEnd("GetInstance");
    getInstance({{"Name", "other"}});
    expectEnd("GetInstance");
}

TEST_F(IdentityOrder, A_path_is_made_placed_and_given_its_key) {
    enumNames();
    EXPECT_THAT(eventsWithin("getAllSimIdentityCMPIObjPaths"),
                ElementsAreArray(joined(
                    {placedPath("ZANTH_SimIdentity"), {"broker: addKey" + std::string(key)}})));
}

TEST_F(IdentityOrder, An_instance_is_filtered_and_then_given_its_key) {
    enumInstances({{"None"}});
    EXPECT_THAT(eventsWithin("makeSimIdentityInstance"),
                ElementsAreArray(joined({placedPath("ZANTH_SimIdentity"),
                                         {"broker: newInstance(root/cimv2:ZANTH_SimIdentity)",
                                          "broker: setPropertyFilter({None},{InstanceID})",
                                          "broker: setProperty" + std::string(key)}})));
}

} // namespace
} // namespace qelo::test
