// The order of what group requests do at the broker, in the store and in the log.
#include "GroupFixture.h"

#include "support/operations/Events.h"

namespace qelo::test {
namespace {

using testing::ElementsAreArray;

class GroupOrder : public GroupFixture {
protected:
    // From CMReturnDone to the end, without the lines of records, whose number is not fixed.
    static Events end() {
        return withoutDestructors(eventsFromLast("broker: returnDone"), "~SimGroup");
    }

    static Events endOf(const std::string& operation) {
        return {"broker: returnDone", "SimGroup_" + operation + ": exit",
                destructorLine("SimGroupObjFactory", "SimGroupFactory")};
    }

    static Events keysThrough(const std::string& slot) {
        return joined({{"broker: " + slot + "(CreationClassName,chars,\"ZANTH_Group\")"},
                       getterLines("SimGroup", "getName", "_name", "wheel"),
                       {"broker: " + slot + "(Name,chars,\"wheel\")"}});
    }
};

TEST_F(GroupOrder, The_factory_goes_after_CMReturnDone_and_the_exit_line) {
    serve({groupNode("wheel")});
    enumNames();
    EXPECT_THAT(end(), ElementsAreArray(endOf("EnumInstanceNames")));
    enumInstances();
    EXPECT_THAT(end(), ElementsAreArray(endOf("EnumInstances")));
    getInstance(groupKeys("wheel"));
    EXPECT_THAT(end(), ElementsAreArray(endOf("GetInstance")));
    getInstance({{"CreationClassName", "ZANTH_Group"}});
    EXPECT_THAT(end(), ElementsAreArray(endOf("GetInstance")));
}

TEST_F(GroupOrder, A_path_is_made_and_placed_and_gets_its_keys_one_after_the_other) {
    serve({groupNode("wheel")});
    enumNames();
    EXPECT_THAT(withoutDestructors(eventsWithin("getAllSimGroupCMPIObjPaths"), "~SimGroup"),
                ElementsAreArray(joined({placedPath("ZANTH_Group"), keysThrough("addKey")})));
}

TEST_F(GroupOrder, An_instance_is_filtered_and_gets_its_keys_one_after_the_other) {
    serve({groupNode("wheel")});
    enumInstances({{"None"}});
    EXPECT_THAT(
        eventsWithin("makeSimGroupInstance"),
        ElementsAreArray(joined({placedPath("ZANTH_Group"),
                                 {"broker: newInstance(root/cimv2:ZANTH_Group)",
                                  "broker: setPropertyFilter({None},{CreationClassName,Name})"},
                                 keysThrough("setProperty")})));
}

TEST_F(GroupOrder, A_record_goes_after_the_cursor_has_moved_on) {
    serve({groupNode("wheel")});
    enumNames();
    EXPECT_THAT(lastOf(eventsWithin("setVector"), 3),
                ElementsAreArray({std::string("store: operator++()"),
                                  destructorLine("SimGroup", "SimGroup"),
                                  std::string("store: operator bool()->0")}));
}

} // namespace
} // namespace qelo::test
