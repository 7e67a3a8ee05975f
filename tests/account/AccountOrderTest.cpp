// The order of what account requests do at the broker, in the store and in the log, and whose
// status they hand on.
#include "AccountFixture.h"

#include "support/operations/Events.h"

namespace qelo::test {
namespace {

using testing::Contains;
using testing::ElementsAreArray;
using testing::IsEmpty;

constexpr const char* providerUnit = "SimAccountProvider";

class AccountOrder : public AccountFixture {
protected:
    // From CMReturnDone to the end, without the lines of records, whose number is not fixed.
    static Events end() {
        return withoutDestructors(eventsFromLast("broker: returnDone"), "~SimAccount");
    }

    static Events endOf(const std::string& operation) {
        return joined({{"broker: returnDone"},
                       exitMarker(providerUnit, "SimAccount_" + operation),
                       {destructorLine("SimAccountObjFactory", "SimAccountFactory")}});
    }

    // Setting one of the keys: its text is taken, then it is set.
    static Events keysThrough(const std::string& slot) {
        const auto set = [&](const std::string& name, const std::string& text) {
            return "broker: " + slot + "(" + name + ",chars,\"" + text + "\")";
        };
        return joined(
            {{set("SystemCreationClassName", "ZANTH_ComputerSystem"), "platform: getSystemName()",
              set("SystemName", "host.example"), set("CreationClassName", "ZANTH_Account")},
             getterLines("SimAccount", "getName", "_name", "alice"),
             {set("Name", "alice")}});
    }

    const Fault broken_ = Fault::error(CMPI_RC_ERR_ACCESS_DENIED, "no access");
};

TEST_F(AccountOrder, The_factory_goes_after_CMReturnDone_and_the_exit_marker) {
    serve({accountNode("alice")});
    enumNames();
    EXPECT_THAT(end(), ElementsAreArray(endOf("EnumInstanceNames")));
    enumInstances();
    EXPECT_THAT(end(), ElementsAreArray(endOf("EnumInstances")));
    getInstance(accountKeys("alice"));
    EXPECT_THAT(end(), ElementsAreArray(endOf("GetInstance")));
    getInstance({{"SystemName", "host.example"}});
    EXPECT_THAT(end(), ElementsAreArray(endOf("GetInstance")));
}

TEST_F(AccountOrder, A_path_is_made_and_placed_and_gets_its_keys_one_after_the_other) {
    serve({accountNode("alice")});
    enumNames();
    EXPECT_THAT(withoutDestructors(eventsWithin("getAllSimAccountCMPIObjPaths"), "~SimAccount"),
                ElementsAreArray(joined({placedPath("ZANTH_Account"), keysThrough("addKey")})));
}

TEST_F(AccountOrder, An_instance_is_filtered_and_gets_its_keys_one_after_the_other) {
    serve({accountNode("alice")});
    enumInstances({{"None"}});
    EXPECT_THAT(eventsWithin("makeSimAccountInstance"),
                ElementsAreArray(
                    joined({placedPath("ZANTH_Account"),
                            {"broker: newInstance(root/cimv2:ZANTH_Account)",
                             "broker: setPropertyFilter({None},{SystemCreationClassName,SystemName,"
                             "CreationClassName,Name})"},
                            keysThrough("setProperty")})));
}

TEST_F(AccountOrder, A_record_goes_after_the_cursor_has_moved_on) {
    serve({accountNode("alice")});
    enumNames();
    EXPECT_THAT(lastOf(eventsWithin("setVector"), 3),
                ElementsAreArray({std::string("store: operator++()"),
                                  destructorLine("SimAccount", "SimAccount"),
                                  std::string("store: operator bool()->0")}));
}

// ---- whose status is handed on ----

TEST_F(AccountOrder, The_status_of_counting_the_keys_is_the_requests) {
    serve({accountNode("alice")});
    broker_.failSlot("getKeyCount", 1, broken_);
    const Outcome outcome = getInstance(accountKeys("alice"));
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(outcome.message, "no access");
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_THAT(failureTexts(), Contains("At least one key should be passed"));
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(AccountOrder, The_status_of_the_last_path_compared_is_the_requests) {
    serve({accountNode("alice"), accountNode("bob")});
    broker_.failSlot("getObjectPath", 2, broken_);
    const Outcome outcome = getInstance({{"SystemName", "elsewhere"}});
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
    broker_.clearFaults();
    broker_.failSlot("getObjectPath", 1, broken_);
    platform_.forget();
    platform_.setPathAnswers({true});
    expectSuccess(getInstance({{"SystemName", "host.example"}}));
    EXPECT_THAT(returnedNames(), ElementsAreArray({"bob"}));
}

TEST_F(AccountOrder, The_status_of_reading_the_key_is_not_the_requests) {
    serve({accountNode("alice")});
    broker_.failSlot("getKey", 1, broken_);
    platform_.setPathAnswers({true});
    expectSuccess(getInstance(accountKeys("alice")));
    EXPECT_THAT(returnedNames(), ElementsAreArray({"alice"}));
}

} // namespace
} // namespace qelo::test
