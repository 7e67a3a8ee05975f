// How account nodes become records.
#include "support/platform/RecordingPlatform.h"
#include "support/platform/SampleNodes.h"
#include "support/platform/TracePoints.h"

#include <ProviderException.h>
#include <account/SimAccount.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using Tesk::SimpleIdentityManagementProvider::getSimAccountInstances;
using Tesk::SimpleIdentityManagementProvider::setVector;
using Tesk::SimpleIdentityManagementProvider::SimAccount;
using testing::Contains;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

constexpr bool wereRead = false;
constexpr bool couldNotBeRead = true;

class AccountLoader : public testing::Test {
protected:
    void SetUp() override { platform_.reset(); }

    void addAccountWith(Properties id, PropertyValue value) {
        StoreNode node = accountNode("alice");
        node.properties[id] = std::move(value);
        platform_.addNode(std::move(node));
    }

    void addAccountInState(const std::string& name, unsigned int state) {
        StoreNode node = accountNode(name);
        node.properties[AccountState] = state;
        platform_.addNode(std::move(node));
    }

    // The only record that the store yields.
    SimAccount onlyAccount() {
        EXPECT_EQ(getSimAccountInstances(accounts_), wereRead);
        EXPECT_EQ(accounts_.size(), 1U);
        return accounts_.empty() ? SimAccount() : accounts_.front();
    }

    std::vector<std::string> names() {
        std::vector<std::string> result;
        for (SimAccount& account : accounts_) {
            result.push_back(account.getName());
        }
        return result;
    }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    std::vector<SimAccount> accounts_;
};

TEST_F(AccountLoader, Without_an_administration_node_nothing_can_be_read) {
    platform_.addNode(accountNode("alice"));
    EXPECT_EQ(getSimAccountInstances(accounts_), couldNotBeRead);
    EXPECT_THAT(accounts_, IsEmpty());
    EXPECT_THAT(platform_.storeCallTexts(),
                ElementsAre("Instrumentation()", "selectNode(17)", "operator bool()->0",
                            "~Instrumentation()"));
}

TEST_F(AccountLoader, Without_any_account_node_nothing_can_be_read) {
    platform_.addNode(administrationNode());
    EXPECT_EQ(getSimAccountInstances(accounts_), couldNotBeRead);
    EXPECT_THAT(accounts_, IsEmpty());
    EXPECT_THAT(platform_.storeCallTexts(),
                ElementsAre("Instrumentation()", "selectNode(17)", "operator bool()->1",
                            "getPathToNode()->/admin", "selectNode(46)", "operator bool()->0",
                            "~Instrumentation()"));
}

TEST_F(AccountLoader, Accounts_elsewhere_than_under_the_administration_node_are_not_listed) {
    platform_.addNode(administrationNode());
    platform_.addNode({UserAccount, "/other/account", {{Name, "alice"}}});
    platform_.addNode({UserAccount, "/administrator", {{Name, "bob"}}});
    EXPECT_EQ(getSimAccountInstances(accounts_), wereRead);
    EXPECT_THAT(accounts_, IsEmpty());
    EXPECT_EQ(platform_.countStoreCalls("setFilter(1,/admin)"), 1U);
}

TEST_F(AccountLoader, Two_accounts_are_read_in_store_order) {
    platform_.addNode(administrationNode());
    platform_.addNode(accountNode("zoe"));
    platform_.addNode(accountNode("alice"));
    EXPECT_EQ(getSimAccountInstances(accounts_), wereRead);
    EXPECT_THAT(names(), ElementsAre("zoe", "alice"));
}

TEST_F(AccountLoader, Records_are_appended_to_what_the_vector_holds) {
    platform_.addNode(administrationNode());
    platform_.addNode(accountNode("alice"));
    getSimAccountInstances(accounts_);
    getSimAccountInstances(accounts_);
    EXPECT_THAT(names(), ElementsAre("alice", "alice"));
}

TEST_F(AccountLoader, The_22_properties_are_read_in_their_fixed_order) {
    platform_.addNode(administrationNode());
    platform_.addNode(fullAccountNode("alice"));
    getSimAccountInstances(accounts_);
    EXPECT_THAT(platform_.storeCallTexts(), ElementsAreArray(std::vector<std::string>{
                                                "Instrumentation()",
                                                "selectNode(17)",
                                                "operator bool()->1",
                                                "getPathToNode()->/admin",
                                                "selectNode(46)",
                                                "operator bool()->1",
                                                "setFilter(1,/admin)",
                                                "operator bool()->1",
                                                "getProperty(108,string)->alice",
                                                "getProperty(312,string)->Full name of alice",
                                                "getProperty(89,string)->1001",
                                                "getProperty(311,string)->100",
                                                "getProperty(117,string)->Secret-of-the-account",
                                                "getProperty(113,string)->Organisation",
                                                "getProperty(108,string)->alice",
                                                "getProperty(123,uint32)->1",
                                                "getProperty(163,uint32)->90",
                                                "getProperty(123,uint32)->1",
                                                "getProperty(91,string)->2014-03-07 12:30:05",
                                                "getProperty(106,uint32)->5",
                                                "getProperty(44,uint32)->30",
                                                "getProperty(118,string)->2015-04-08 13:31:06",
                                                "getProperty(119,uint32)->4",
                                                "getProperty(137,uint32 list)->[1,7,3]",
                                                "getProperty(158,string)->/home/alice",
                                                "getProperty(159,string)->/bin/bash",
                                                "getProperty(160,string)->2013-02-06 11:29:04",
                                                "getProperty(161,uint32)->2",
                                                "getProperty(162,uint32)->7",
                                                "getProperty(123,uint32)->1",
                                                "operator++()",
                                                "operator bool()->0",
                                                "~Instrumentation()"}));
}

TEST_F(AccountLoader, Every_property_reaches_its_field) {
    platform_.addNode(administrationNode());
    platform_.addNode(fullAccountNode("alice"));
    SimAccount account = onlyAccount();
    EXPECT_EQ(account.getName(), "alice");
    EXPECT_EQ(account.getElementName(), "alice");
    EXPECT_EQ(account.getFullName(), "Full name of alice");
    EXPECT_EQ(account.getUserID(), "1001");
    EXPECT_EQ(account.getGroupId(), 100U);
    EXPECT_EQ(account.getUserPassword(), "Secret-of-the-account");
    EXPECT_EQ(account.getOrganizationName(), "Organisation");
    EXPECT_EQ(account.getRequestedState(), 2U);
    EXPECT_EQ(account.getEnabledState(), 2U);
    EXPECT_FALSE(account.getAccountDisable());
    EXPECT_EQ(account.getdaysMustChangePasswordAfter(), 90U);
    EXPECT_EQ(account.getInactivityTimeout(), "2014-03-07 12:30:05");
    EXPECT_EQ(account.getMaxLoginFailures(), 5U);
    EXPECT_EQ(account.getDaysExpireAfter(), 30U);
    EXPECT_EQ(account.getPasswordExpiration(), "2015-04-08 13:31:06");
    EXPECT_EQ(account.getPasswordHistoryDepth(), 4U);
    EXPECT_THAT(account.getPasswordRules(), ElementsAre(2, 8, 4));
    EXPECT_EQ(account.getHomeDirectory(), "/home/alice");
    EXPECT_EQ(account.getScriptPath(), "/bin/bash");
    EXPECT_EQ(account.getPasswordLastChanged(), "2013-02-06 11:29:04");
    EXPECT_EQ(account.getPasswordDaysMustKeep(), 2U);
    EXPECT_EQ(account.getPasswordDaysWarnBeforeExpire(), 7U);
}

TEST_F(AccountLoader, A_node_lacking_every_property_yields_a_record_of_defaults) {
    platform_.addNode(administrationNode());
    platform_.addNode(bareAccountNode());
    SimAccount account = onlyAccount();
    EXPECT_EQ(account.getName(), "");
    EXPECT_EQ(account.getElementName(), "");
    EXPECT_EQ(account.getUserPassword(), "");
    EXPECT_EQ(account.getGroupId(), 0U);
    EXPECT_EQ(account.getRequestedState(), 0U);
    EXPECT_EQ(account.getEnabledState(), 0U);
    EXPECT_FALSE(account.getAccountDisable());
    EXPECT_THAT(account.getPasswordRules(), IsEmpty());
}

TEST_F(AccountLoader, What_a_node_lacks_is_not_taken_from_the_node_before_it) {
    platform_.addNode(administrationNode());
    platform_.addNode(fullAccountNode("alice"));
    platform_.addNode(bareAccountNode());
    EXPECT_EQ(getSimAccountInstances(accounts_), wereRead);
    ASSERT_EQ(accounts_.size(), 2U);
    EXPECT_EQ(accounts_[1].getName(), "");
    EXPECT_EQ(accounts_[1].getUserPassword(), "");
    EXPECT_EQ(accounts_[1].getGroupId(), 0U);
    EXPECT_EQ(accounts_[1].getRequestedState(), 0U);
    EXPECT_EQ(accounts_[1].getMaxLoginFailures(), 0U);
    EXPECT_THAT(accounts_[1].getPasswordRules(), IsEmpty());
}

TEST_F(AccountLoader, A_property_of_another_type_counts_as_absent) {
    platform_.addNode(administrationNode());
    addAccountWith(AccountState, "1");
    EXPECT_EQ(onlyAccount().getRequestedState(), 0U);
}

TEST_F(AccountLoader, AccountState_1_12_and_16_are_taken) {
    platform_.addNode(administrationNode());
    addAccountInState("usable", 1);
    addAccountInState("expired", 12);
    addAccountInState("locked", 16);
    EXPECT_EQ(getSimAccountInstances(accounts_), wereRead);
    ASSERT_EQ(accounts_.size(), 3U);
    const unsigned int states[] = {2, 6, 3};
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_EQ(accounts_[i].getRequestedState(), states[i]);
        EXPECT_EQ(accounts_[i].getEnabledState(), states[i]);
        EXPECT_EQ(accounts_[i].getAccountDisable(), i == 2);
    }
}

class RefusedState : public AccountLoader, public testing::WithParamInterface<unsigned int> {};

TEST_P(RefusedState, Is_refused_and_keeps_earlier_accounts) {
    platform_.addNode(administrationNode());
    addAccountInState("alice", 1);
    addAccountInState("bob", GetParam());
    addAccountInState("carol", 1);
    EXPECT_EQ(getSimAccountInstances(accounts_), couldNotBeRead);
    EXPECT_THAT(names(), ElementsAre("alice"));
    const auto points = tracePoints(platform_.lines());
    EXPECT_THAT(points, Contains("6000 Corvane.SimAccountObj getSimAccountInstances SimAccount: "
                                 "MESSAGE [File: SimAccount, Line: #]: Failed while setting "
                                 "Requested State"));
    EXPECT_EQ(platform_.openCursors(), 0U);
}

TEST_P(RefusedState, Throws_a_ProviderException_out_of_setVector) {
    platform_.addNode(administrationNode());
    addAccountInState("alice", 1);
    addAccountInState("bob", GetParam());
    Tesk::Instrumentation cursor;
    cursor.selectNode(UserAccount);
    try {
        setVector(accounts_, cursor);
        FAIL() << "nothing was thrown";
    } catch (const Tesk::ProviderException& refused) {
        EXPECT_STREQ(refused.what(), "Failed while setting Requested State");
    }
    EXPECT_THAT(names(), ElementsAre("alice"));
}

INSTANTIATE_TEST_SUITE_P(AccountState, RefusedState, testing::Values(0U, 2U, 17U),
                         testing::PrintToStringParamName());

struct GroupIdCase {
    const char* text;
    unsigned int value;
};

void PrintTo(const GroupIdCase& test, std::ostream* stream) {
    *stream << testing::PrintToString(test.text);
}

class GroupIdText : public AccountLoader, public testing::WithParamInterface<GroupIdCase> {};

TEST_P(GroupIdText, Is_read_as_a_decimal_number) {
    platform_.addNode(administrationNode());
    addAccountWith(GroupId, GetParam().text);
    EXPECT_EQ(onlyAccount().getGroupId(), GetParam().value);
}

INSTANTIATE_TEST_SUITE_P(Texts, GroupIdText,
                         testing::Values(GroupIdCase{"42", 42}, GroupIdCase{"42abc", 42},
                                         GroupIdCase{"abc", 0}, GroupIdCase{"", 0},
                                         GroupIdCase{"x42", 0}, GroupIdCase{"010", 10},
                                         GroupIdCase{"0x1f", 0}, GroupIdCase{" 7", 7},
                                         GroupIdCase{"4294967295", 4294967295U}));

TEST_F(AccountLoader, An_account_without_a_state_is_listed) {
    platform_.addNode(administrationNode());
    platform_.addNode({UserAccount, "/admin/account", {{Name, "alice"}}});
    SimAccount account = onlyAccount();
    EXPECT_EQ(account.getName(), "alice");
    EXPECT_EQ(account.getRequestedState(), 0U);
    EXPECT_EQ(account.getEnabledState(), 0U);
}

// ---- failures of the store ----

TEST_F(AccountLoader, A_failing_store_is_traced_and_keeps_the_accounts_read_before) {
    platform_.addNode(administrationNode());
    platform_.addNode(accountNode("alice"));
    platform_.addNode(accountNode("bob"));
    platform_.failOperation("getProperty", 30, StoreFault::ThrowsRuntimeError);
    EXPECT_EQ(getSimAccountInstances(accounts_), couldNotBeRead);
    EXPECT_THAT(names(), ElementsAre("alice"));
    EXPECT_THAT(tracePoints(platform_.lines()),
                Contains("6000 Corvane.SimAccountObj getSimAccountInstances SimAccount: "
                         "MESSAGE [File: SimAccount, Line: #]: the store failed"));
    EXPECT_EQ(platform_.openCursors(), 0U);
}

TEST_F(AccountLoader, Whatever_store_call_throws_no_exception_passes_and_no_cursor_stays) {
    platform_.addNode(administrationNode());
    platform_.addNode(fullAccountNode("alice"));
    getSimAccountInstances(accounts_);
    const std::size_t calls = platform_.storeCallCount();
    ASSERT_GT(calls, 22U);
    for (std::size_t n = 1; n <= calls; ++n) {
        accounts_.clear();
        SetUp();
        platform_.addNode(administrationNode());
        platform_.addNode(fullAccountNode("alice"));
        platform_.failStoreCall(n, StoreFault::ThrowsRuntimeError);
        EXPECT_EQ(getSimAccountInstances(accounts_), couldNotBeRead) << "call " << n;
        EXPECT_EQ(platform_.openCursors(), 0U) << "call " << n;
    }
}

TEST_F(AccountLoader, A_property_that_cannot_be_read_keeps_its_default) {
    for (std::size_t n = 1; n <= 22; ++n) {
        accounts_.clear();
        SetUp();
        platform_.addNode(administrationNode());
        platform_.addNode(fullAccountNode("alice"));
        platform_.failOperation("getProperty", n, StoreFault::ReturnsFalse);
        EXPECT_EQ(getSimAccountInstances(accounts_), wereRead) << "property " << n;
        EXPECT_EQ(accounts_.size(), 1U) << "property " << n;
    }
}

// ---- trace ----

TEST_F(AccountLoader, Listing_no_account_is_traced) {
    platform_.addNode(administrationNode());
    platform_.addNode({UserAccount, "/other/account", {}});
    getSimAccountInstances(accounts_);
    const std::string vector = " vectSimAccount=@";
    const std::string both = vector + " instrumentation=@";
    expectSamePoints(tracePoints(platform_.lines()),
                     ExpectedTrace()
                         .entering(unit::account, "getSimAccountInstances", vector)
                         .entering(unit::account, "setVector", both)
                         .exiting(unit::account, "setVector", both)
                         .exiting(unit::account, "getSimAccountInstances", vector));
}

TEST_F(AccountLoader, The_password_is_in_no_line) {
    platform_.addNode(administrationNode());
    platform_.addNode(fullAccountNode("alice"));
    getSimAccountInstances(accounts_);
    for (const LogLine& line : platform_.lines()) {
        EXPECT_THAT(line.message, Not(HasSubstr("Secret-of-the-account")));
    }
}

} // namespace
} // namespace qelo::test
