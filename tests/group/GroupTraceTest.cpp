// The lines that group requests leave in the log and in the trace.
#include "GroupFixture.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const Unit& factory = source::groupFactory;

class GroupTrace : public GroupFixture {
protected:
    // That function's lines are one entry and one exit with this parameter list.
    void expectEntryAndExit(const std::string& function, const std::string& params) const {
        expectSamePoints(
            pointsIn(function),
            ExpectedTrace().entering(factory, function, params).exiting(factory, function, params));
    }

    void expectEntryAlone(const std::string& function, const std::string& params) const {
        expectSamePoints(pointsIn(function), ExpectedTrace().entering(factory, function, params));
    }
};

TEST_F(GroupTrace, Operations_write_plain_entry_and_exit_lines) {
    serve({groupNode("wheel")});
    enumNames();
    expectSamePoints(pointsOf(source::groupProvider), plainLines("EnumInstanceNames", true));
    platform_.forget();
    enumInstances();
    expectSamePoints(pointsOf(source::groupProvider), plainLines("EnumInstances", true));
    platform_.forget();
    getInstance(groupKeys("wheel"));
    expectSamePoints(pointsOf(source::groupProvider), plainLines("GetInstance", true));
}

TEST_F(GroupTrace, No_provider_marker_is_written) {
    serve({groupNode("wheel")});
    enumNames();
    enumInstances();
    getInstance(groupKeys("wheel"));
    invoke("Method", broker_.makeArgs());
    EXPECT_THAT(pointsIn("markProviderEntry"), IsEmpty());
    EXPECT_THAT(pointsIn("markProviderExit"), IsEmpty());
}

TEST_F(GroupTrace, The_entry_line_comes_first_and_the_refresh_after_it) {
    serve({groupNode("wheel")});
    enumNames();
    const std::vector<std::string> all = points();
    EXPECT_EQ(all.at(0), plainLines("EnumInstanceNames", false).points().at(0));
    EXPECT_NE(all.at(1).find(" refreshGroupNode "), std::string::npos);
}

TEST_F(GroupTrace, Collecting_paths_traces_its_parameters) {
    serve({groupNode("wheel")});
    enumNames();
    expectEntryAndExit("getAllSimGroupCMPIObjPaths", " broker=@ ref=@ objectPaths=@ status=@");
}

TEST_F(GroupTrace, Making_an_instance_traces_its_parameters) {
    serve({groupNode("wheel")});
    enumInstances();
    expectEntryAndExit("makeSimGroupInstance",
                       " broker=@ ref=@ simGroup=@ properties=0 isObjPath=0 rc=@");
}

TEST_F(GroupTrace, An_instance_that_cannot_be_made_is_left_with_an_exit_line) {
    serve({groupNode("wheel")});
    for (const char* slot : {"newObjectPath", "newInstance"}) {
        platform_.forget();
        broker_.clearFaults();
        broker_.failSlot(slot, 1, Fault::null());
        enumInstances();
        expectEntryAndExit("makeSimGroupInstance",
                           " broker=@ ref=@ simGroup=@ properties=0 isObjPath=0 rc=@");
    }
}

TEST_F(GroupTrace, Looking_up_an_unknown_group_leaves_without_an_exit_line) {
    serve({groupNode("wheel")});
    const std::string params = " broker=@ ref=@ key=@ properties=0 instances=@ rc=@";
    getInstance(groupKeys("wheel"));
    expectEntryAndExit("getOneSimGroupCMPIInstance", params);
    platform_.forget();
    getInstance(groupKeys("staff"));
    expectEntryAlone("getOneSimGroupCMPIInstance", params);
}

TEST_F(GroupTrace, A_name_enumeration_that_finds_nothing_or_fails_has_no_exit_line) {
    serve({});
    enumNames();
    expectSamePoints(pointsOf(source::groupProvider), plainLines("EnumInstanceNames", false));
}

TEST_F(GroupTrace, Something_thrown_is_traced_under_the_provider_and_ends_the_operation) {
    serve({groupNode("wheel")});
    platform_.failOperation("selectNode", 2, StoreFault::ThrowsForeign);
    const Outcome outcome = enumNames();
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(outcome.hasMessage);
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(messages(), ElementsAre(outcome.message));
    auto expected = plainLines("EnumInstanceNames", false);
    expected.message(source::groupProvider, "SimGroup_EnumInstanceNames", outcome.message);
    expectSamePoints(pointsOf(source::groupProvider), expected);
}

TEST_F(GroupTrace, Levels_are_3000_4000_and_6000_only) {
    serve({groupNode("wheel", {"a"})});
    enumNames();
    enumInstances();
    getInstance(groupKeys("staff"));
    platform_.refuseWrites(Tesk::NodeLexicon::AdminCommand);
    invoke("Method", broker_.makeArgs().string("S", "v"));
    for (const LogLine& line : platform_.lines()) {
        EXPECT_TRUE(line.level == 3000 || line.level == 4000 || line.level == 6000) << line.level;
    }
}

TEST_F(GroupTrace, Every_line_reaches_the_log_and_then_the_trace) {
    serve({groupNode("wheel", {"a"})});
    enumInstances();
    EXPECT_FALSE(points().empty()); // which compares the two
}

} // namespace
} // namespace qelo::test
