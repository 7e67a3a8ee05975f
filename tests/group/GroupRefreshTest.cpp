// The refresh handshake with which every group operation begins.
#include "GroupFixture.h"

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAreArray;

constexpr const char* refreshWritten = "setProperty(75,0)->1";

class GroupRefresh : public GroupFixture {
protected:
    void expectWrites(std::size_t count) const {
        EXPECT_EQ(platform_.countStoreCalls(refreshWritten), count);
    }

    std::vector<std::string> callsOfCursor(unsigned int cursor) const {
        std::vector<std::string> texts;
        for (const StoreCall& call : platform_.storeCalls()) {
            if (call.cursor == cursor) {
                texts.push_back(call.text);
            }
        }
        return texts;
    }
};

TEST_F(GroupRefresh, Equal_counts_write_nothing) {
    serve({groupNode("wheel"), groupNode("adm")});
    enumNames();
    expectWrites(0);
    EXPECT_THAT(callsOfCursor(1),
                ElementsAre("Instrumentation()", "selectNode(51)", "operator bool()->1",
                            "getProperty(51,uint32)->2", "getNodeSize()->2", "~Instrumentation()"));
}

TEST_F(GroupRefresh, A_larger_EntryCount_writes_one_0_to_the_administration_node) {
    serve({groupNode("wheel")});
    platform_.setEntryCount(UserGroup, 2);
    enumNames();
    expectWrites(1);
    EXPECT_THAT(callsOfCursor(2),
                ElementsAre("Instrumentation()", "selectNode(17)", "operator bool()->1",
                            refreshWritten, "~Instrumentation()"));
}

TEST_F(GroupRefresh, A_smaller_EntryCount_writes_one_0) {
    serve({groupNode("wheel"), groupNode("adm")});
    platform_.setEntryCount(UserGroup, 1);
    enumNames();
    expectWrites(1);
}

TEST_F(GroupRefresh, An_unreadable_EntryCount_counts_as_0) {
    serve({groupNode("wheel")});
    platform_.makeEntryCountUnreadable(UserGroup);
    enumNames();
    expectWrites(1);
}

TEST_F(GroupRefresh, The_count_of_accounts_is_not_looked_at) {
    serve({groupNode("wheel")});
    platform_.addNode(accountNode("alice"));
    platform_.setEntryCount(UserAccount, 9);
    enumNames();
    expectWrites(0);
    EXPECT_EQ(platform_.countStoreCalls("selectNode(46)"), 0U);
}

TEST_F(GroupRefresh, Without_a_group_node_nothing_is_compared_or_written) {
    serve({});
    enumNames();
    EXPECT_THAT(callsOfCursor(1), ElementsAre("Instrumentation()", "selectNode(51)",
                                              "operator bool()->0", "~Instrumentation()"));
    expectWrites(0);
}

TEST_F(GroupRefresh, Without_an_administration_node_nothing_is_written) {
    platform_.addNode(groupNode("wheel"));
    platform_.setEntryCount(UserGroup, 9);
    expectOk(enumInstances());
    EXPECT_THAT(returned("Name"), ElementsAre("wheel"));
    EXPECT_EQ(platform_.countStoreCalls("selectNode(17)"), 1U);
    expectWrites(0);
}

TEST_F(GroupRefresh, A_refused_write_changes_nothing) {
    serve({groupNode("wheel")});
    platform_.setEntryCount(UserGroup, 9);
    platform_.refuseWrites(RefreshRequest);
    expectOk(enumNames());
    EXPECT_EQ(platform_.countStoreCalls("setProperty(75,0)->0"), 1U);
    EXPECT_THAT(returned("Name"), ElementsAre("wheel"));
    EXPECT_THAT(messages(), IsEmpty());
}

TEST_F(GroupRefresh, Every_operation_asks_once_and_before_anything_else) {
    serve({groupNode("wheel")});
    platform_.setEntryCount(UserGroup, 9);
    const std::vector<std::function<void()>> operations = {
        [&] { enumNames(); },
        [&] { enumInstances(); },
        [&] { getInstance(groupKeys("wheel")); },
        [&] {
            getInstance({{"CreationClassName", "ZANTH_Group"}});
        },
        [&] { getInstance({}); },
        [&] { invoke("Method", broker_.makeArgs()); },
        [&] { invoke("Method", broker_.makeArgs(), "ZANTH_Account"); },
    };
    for (const auto& operation : operations) {
        platform_.forget();
        operation();
        expectWrites(1);
        EXPECT_EQ(platform_.storeCallTexts().at(1), "selectNode(51)");
    }
}

TEST_F(GroupRefresh, Both_counts_are_traced_as_variables) {
    serve({groupNode("wheel")});
    platform_.setEntryCount(UserGroup, 9);
    enumNames();
    const auto expected = ExpectedTrace()
                              .variable(source::groupFactory, "refreshGroupNode", "nodeSize", "1")
                              .variable(source::groupFactory, "refreshGroupNode", "user_sz", "9");
    EXPECT_THAT(pointsIn("refreshGroupNode"), UnorderedElementsAreArray(expected.points()));
}

TEST_F(GroupRefresh, A_failing_store_is_traced_and_the_request_goes_on) {
    for (const char* operation : {"Instrumentation", "selectNode", "operator bool", "getProperty",
                                  "getNodeSize", "setProperty"}) {
        platform_.reset();
        serve({groupNode("wheel")});
        platform_.setEntryCount(UserGroup, 9);
        platform_.failOperation(operation, 1, StoreFault::ThrowsRuntimeError);
        expectOk(enumNames());
        EXPECT_THAT(returned("Name"), ElementsAre("wheel")) << operation;
        EXPECT_THAT(pointsIn("refreshGroupNode"),
                    Contains(pointText(source::groupFactory.component, "refreshGroupNode",
                                       source::groupFactory.file, 6000,
                                       "MESSAGE [File: SimGroupObjFactory, Line: #]: the store "
                                       "failed")))
            << operation;
    }
}

} // namespace
} // namespace qelo::test
