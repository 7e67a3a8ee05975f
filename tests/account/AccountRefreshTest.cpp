// The refresh handshake with which every account operation begins.
#include "AccountFixture.h"

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

constexpr const char* refreshWritten = "setProperty(75,0)->1";

class AccountRefresh : public AccountFixture {
protected:
    void expectWrites(std::size_t count) {
        EXPECT_EQ(platform_.countStoreCalls(refreshWritten), count);
    }
    // What the store was asked before the listing began, which opens a cursor of its own.
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

TEST_F(AccountRefresh, Equal_counts_write_nothing) {
    serve({accountNode("alice"), accountNode("bob")});
    enumNames();
    expectWrites(0);
    EXPECT_THAT(callsOfCursor(1),
                ElementsAre("Instrumentation()", "selectNode(46)", "operator bool()->1",
                            "getProperty(51,uint32)->2", "getNodeSize()->2", "~Instrumentation()"));
}

TEST_F(AccountRefresh, A_larger_EntryCount_writes_one_0) {
    serve({accountNode("alice")});
    platform_.setEntryCount(UserAccount, 2);
    enumNames();
    expectWrites(1);
    EXPECT_THAT(callsOfCursor(2),
                ElementsAre("Instrumentation()", "selectNode(17)", "operator bool()->1",
                            refreshWritten, "~Instrumentation()"));
}

TEST_F(AccountRefresh, A_smaller_EntryCount_writes_one_0) {
    serve({accountNode("alice"), accountNode("bob")});
    platform_.setEntryCount(UserAccount, 1);
    enumNames();
    expectWrites(1);
}

TEST_F(AccountRefresh, An_unreadable_EntryCount_counts_as_0) {
    serve({accountNode("alice")});
    platform_.makeEntryCountUnreadable(UserAccount);
    enumNames();
    expectWrites(1);
    EXPECT_THAT(points(), Contains(pointText("Corvane.SimAccountObjFactory", "refreshGroupUserInfo",
                                             "SimAccountObjFactory", 4000,
                                             "VARIABLE: 'user_sz' has Value '0' at line # in "
                                             "SimAccountObjFactory")));
}

TEST_F(AccountRefresh, Without_any_account_node_nothing_is_compared_or_written) {
    serve({});
    enumNames();
    EXPECT_THAT(callsOfCursor(1), ElementsAre("Instrumentation()", "selectNode(46)",
                                              "operator bool()->0", "~Instrumentation()"));
    expectWrites(0);
}

TEST_F(AccountRefresh, Without_an_administration_node_nothing_is_written) {
    platform_.addNode(accountNode("alice"));
    platform_.setEntryCount(UserAccount, 9);
    expectSuccess(enumInstances());
    expectWrites(0);
}

TEST_F(AccountRefresh, A_refused_write_changes_nothing) {
    serve({accountNode("alice")});
    platform_.setEntryCount(UserAccount, 9);
    platform_.refuseWrites(RefreshRequest);
    expectSuccess(enumNames());
    EXPECT_EQ(platform_.countStoreCalls("setProperty(75,0)->0"), 1U);
    EXPECT_THAT(returnedNames(), ElementsAre("alice"));
    EXPECT_THAT(failureTexts(), IsEmpty());
}

TEST_F(AccountRefresh, Every_operation_asks_once_and_before_anything_else) {
    serve({accountNode("alice")});
    platform_.setEntryCount(UserAccount, 9);
    enumInstances();
    expectWrites(1);
    platform_.forget();
    getInstance(accountKeys("alice"));
    expectWrites(1);
    platform_.forget();
    getInstance({});
    expectWrites(1);
    platform_.forget();
    invoke("Method", broker_.makeArgs());
    expectWrites(1);
    platform_.forget();
    invoke("Method", broker_.makeArgs(), "ZANTH_Group");
    expectWrites(1);
    EXPECT_EQ(platform_.storeCallTexts()[1], "selectNode(46)");
}

TEST_F(AccountRefresh, A_failing_store_is_traced_and_the_request_goes_on) {
    for (const char* operation : {"Instrumentation", "selectNode", "operator bool", "getProperty",
                                  "getNodeSize", "setProperty"}) {
        platform_.reset();
        serve({accountNode("alice")});
        platform_.setEntryCount(UserAccount, 9);
        platform_.failOperation(operation, 1, StoreFault::ThrowsRuntimeError);
        expectSuccess(enumNames());
        EXPECT_THAT(returnedNames(), ElementsAre("alice")) << operation;
        EXPECT_THAT(points(),
                    Contains(pointText("Corvane.SimAccountObjFactory", "refreshGroupUserInfo",
                                       "SimAccountObjFactory", 6000,
                                       "MESSAGE [File: SimAccountObjFactory, Line: #]: the store "
                                       "failed")))
            << operation;
    }
}

TEST_F(AccountRefresh, Both_counts_are_traced_as_variables) {
    serve({accountNode("alice")});
    platform_.setEntryCount(UserAccount, 9);
    enumNames();
    std::vector<std::string> ofRefresh;
    for (const std::string& point : points()) {
        if (point.find(" refreshGroupUserInfo ") != std::string::npos) {
            ofRefresh.push_back(point);
        }
    }
    const auto expected =
        ExpectedTrace()
            .variable(unit::accountFactory, "refreshGroupUserInfo", "user_sz", "9")
            .variable(unit::accountFactory, "refreshGroupUserInfo", "nodeSize", "1");
    EXPECT_THAT(ofRefresh, ElementsAreArray(expected.points()));
}

} // namespace
} // namespace qelo::test
