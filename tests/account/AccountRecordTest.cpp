// The account record: what its setters store, what its getters return, and what both trace.
#include "support/platform/RecordingPlatform.h"
#include "support/platform/TracePoints.h"

#include <account/SimAccount.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <string>
#include <vector>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimAccount;
using testing::ElementsAre;
using testing::IsEmpty;

class AccountRecord : public testing::Test {
protected:
    void SetUp() override { platform_.reset(); }
    std::vector<std::string> points() const { return tracePoints(platform_.lines()); }
    void expectPoints(const ExpectedTrace& expected) { expectSamePoints(points(), expected); }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
};

TEST_F(AccountRecord, Starts_with_empty_texts_and_zeros) {
    SimAccount account;
    EXPECT_EQ(account.getName(), "");
    EXPECT_EQ(account.getUserID(), "");
    EXPECT_EQ(account.getGroupId(), 0U);
    EXPECT_EQ(account.getdaysMustChangePasswordAfter(), 0U);
    EXPECT_EQ(account.getFullName(), "");
    EXPECT_EQ(account.getUserPassword(), "");
    EXPECT_EQ(account.getOrganizationName(), "");
    EXPECT_EQ(account.getElementName(), "");
    EXPECT_EQ(account.getRequestedState(), 0U);
    EXPECT_EQ(account.getEnabledState(), 0U);
    EXPECT_EQ(account.getInactivityTimeout(), "");
    EXPECT_EQ(account.getMaxLoginFailures(), 0U);
    EXPECT_EQ(account.getPasswordExpiration(), "");
    EXPECT_EQ(account.getPasswordHistoryDepth(), 0U);
    EXPECT_THAT(account.getPasswordRules(), IsEmpty());
    EXPECT_EQ(account.getHomeDirectory(), "");
    EXPECT_EQ(account.getScriptPath(), "");
    EXPECT_EQ(account.getPasswordLastChanged(), "");
    EXPECT_EQ(account.getPasswordDaysMustKeep(), 0U);
    EXPECT_EQ(account.getDaysExpireAfter(), 0U);
    EXPECT_EQ(account.getPasswordDaysWarnBeforeExpire(), 0U);
    EXPECT_FALSE(account.getAccountDisable());
}

TEST_F(AccountRecord, Construction_and_destruction_are_traced) {
    { SimAccount account; }
    expectPoints(
        ExpectedTrace().method(unit::account, "SimAccount").method(unit::account, "~SimAccount"));
}

TEST_F(AccountRecord, Copying_emits_nothing) {
    SimAccount account;
    account.setName("alice");
    account.setPasswordRules({1});
    platform_.forget();
    {
        SimAccount copy(account);
        SimAccount assigned(account);
        assigned = copy;
        EXPECT_THAT(points(), IsEmpty());
    }
    expectPoints(
        ExpectedTrace().method(unit::account, "~SimAccount").method(unit::account, "~SimAccount"));
}

TEST_F(AccountRecord, A_copy_has_every_field) {
    SimAccount original;
    original.setName("alice");
    original.setGroupId(7);
    original.setUserPassword("secret");
    original.setPasswordRules({1, 2});
    original.setAccountDisable(16);
    SimAccount copy(original);
    original.setName("bob");
    EXPECT_EQ(copy.getName(), "alice");
    EXPECT_EQ(copy.getGroupId(), 7U);
    EXPECT_EQ(copy.getUserPassword(), "secret");
    EXPECT_THAT(copy.getPasswordRules(), ElementsAre(2, 3));
    EXPECT_TRUE(copy.getAccountDisable());
}

// ---- fields that are traced in the ordinary way ----

struct TextField {
    const char* setter;
    const char* getter;
    bool (SimAccount::*set)(std::string);
    std::string (SimAccount::*get)();
    const char* piece;
    const char* variable;
};

void PrintTo(const TextField& field, std::ostream* stream) { *stream << field.getter; }

class TracedText : public AccountRecord, public testing::WithParamInterface<TextField> {};

TEST_P(TracedText, Is_stored_and_traced) {
    const TextField& field = GetParam();
    SimAccount account;
    platform_.forget();
    EXPECT_FALSE((account.*field.set)("some text"));
    EXPECT_EQ((account.*field.get)(), "some text");
    const std::string params = std::string(field.piece) + "some text";
    expectPoints(ExpectedTrace()
                     .entering(unit::account, field.setter, params)
                     .variable(unit::account, field.setter, field.variable, "some text")
                     .exiting(unit::account, field.setter, params)
                     .method(unit::account, field.getter)
                     .variable(unit::account, field.getter, field.variable, "some text"));
}

#define TEXT_FIELD(Name, name)                                                                     \
    TextField {                                                                                    \
        "set" #Name, "get" #Name, &SimAccount::set##Name, &SimAccount::get##Name, " " #name "=",   \
            "_" #name                                                                              \
    }

INSTANTIATE_TEST_SUITE_P(Fields, TracedText,
                         testing::Values(TEXT_FIELD(Name, name), TEXT_FIELD(UserID, userID),
                                         TEXT_FIELD(OrganizationName, organizationName),
                                         TEXT_FIELD(ElementName, elementName),
                                         TEXT_FIELD(InactivityTimeout, inactivityTimeout),
                                         TEXT_FIELD(PasswordExpiration, passwordExpiration),
                                         TEXT_FIELD(HomeDirectory, homeDirectory),
                                         TEXT_FIELD(ScriptPath, scriptPath),
                                         TEXT_FIELD(PasswordLastChanged, passwordLastChanged)),
                         [](const auto& test) { return std::string(test.param.getter); });

struct NumberField {
    const char* setter;
    const char* getter;
    bool (SimAccount::*set)(unsigned int);
    unsigned int (SimAccount::*get)();
    const char* piece;
    const char* variable;
};

void PrintTo(const NumberField& field, std::ostream* stream) { *stream << field.getter; }

class TracedNumber : public AccountRecord, public testing::WithParamInterface<NumberField> {};

TEST_P(TracedNumber, Is_stored_and_traced) {
    const NumberField& field = GetParam();
    SimAccount account;
    platform_.forget();
    EXPECT_FALSE((account.*field.set)(70000));
    EXPECT_EQ((account.*field.get)(), 70000U);
    const std::string params = std::string(field.piece) + "70000";
    expectPoints(ExpectedTrace()
                     .entering(unit::account, field.setter, params)
                     .variable(unit::account, field.setter, field.variable, "70000")
                     .exiting(unit::account, field.setter, params)
                     .method(unit::account, field.getter)
                     .variable(unit::account, field.getter, field.variable, "70000"));
}

TEST_P(TracedNumber, Keeps_its_full_range_and_is_shown_signed_as_a_variable) {
    const NumberField& field = GetParam();
    SimAccount account;
    platform_.forget();
    EXPECT_FALSE((account.*field.set)(UINT_MAX));
    EXPECT_EQ((account.*field.get)(), UINT_MAX);
    const std::string params = std::string(field.piece) + "4294967295";
    expectPoints(ExpectedTrace()
                     .entering(unit::account, field.setter, params)
                     .variable(unit::account, field.setter, field.variable, "-1")
                     .exiting(unit::account, field.setter, params)
                     .method(unit::account, field.getter)
                     .variable(unit::account, field.getter, field.variable, "-1"));
}

#define NUMBER_FIELD(Name, name)                                                                   \
    NumberField {                                                                                  \
        "set" #Name, "get" #Name, &SimAccount::set##Name, &SimAccount::get##Name, " " #name "=",   \
            "_" #name                                                                              \
    }

INSTANTIATE_TEST_SUITE_P(Fields, TracedNumber,
                         testing::Values(NUMBER_FIELD(MaxLoginFailures, maxLoginFailures),
                                         NUMBER_FIELD(PasswordHistoryDepth, passwordHistoryDepth),
                                         NUMBER_FIELD(PasswordDaysMustKeep, passwordDaysMustKeep),
                                         NUMBER_FIELD(DaysExpireAfter, daysExpireAfter),
                                         NUMBER_FIELD(PasswordDaysWarnBeforeExpire,
                                                      passwordDaysWarnBeforeExpire)),
                         [](const auto& test) { return std::string(test.param.getter); });

// ---- fields that are not traced ----

TEST_F(AccountRecord, Group_id_days_to_change_and_full_name_are_stored_without_a_trace) {
    SimAccount account;
    platform_.forget();
    EXPECT_FALSE(account.setGroupId(UINT_MAX));
    EXPECT_FALSE(account.setdaysMustChangePasswordAfter(90));
    EXPECT_FALSE(account.setFullName("Alice A."));
    EXPECT_EQ(account.getGroupId(), UINT_MAX);
    EXPECT_EQ(account.getdaysMustChangePasswordAfter(), 90U);
    EXPECT_EQ(account.getFullName(), "Alice A.");
    EXPECT_THAT(points(), IsEmpty());
}

TEST_F(AccountRecord, The_password_is_stored_and_never_traced) {
    SimAccount account;
    platform_.forget();
    EXPECT_FALSE(account.setUserPassword("hunter2"));
    EXPECT_EQ(account.getUserPassword(), "hunter2");
    expectPoints(
        ExpectedTrace()
            .entering(unit::account, "setUserPassword", " Entered function setUserPassword")
            .exiting(unit::account, "setUserPassword", " Exiting function setUserPassword=")
            .method(unit::account, "getUserPassword"));
}

// ---- states ----

struct StateCase {
    unsigned int store;
    std::uint16_t requested;
    bool refused;
    std::uint16_t enabled;
    bool disabled;
};

void PrintTo(const StateCase& state, std::ostream* stream) { *stream << "state " << state.store; }

class AccountStates : public AccountRecord, public testing::WithParamInterface<StateCase> {};

TEST_P(AccountStates, Map_to_their_CIM_values) {
    const StateCase& state = GetParam();
    SimAccount account;
    account.setRequestedState(1);
    account.setEnabledState(1);
    account.setAccountDisable(16);
    EXPECT_EQ(account.setRequestedState(state.store), state.refused);
    EXPECT_EQ(account.getRequestedState(), state.requested);
    EXPECT_FALSE(account.setEnabledState(state.store));
    EXPECT_EQ(account.getEnabledState(), state.enabled);
    EXPECT_FALSE(account.setAccountDisable(state.store));
    EXPECT_EQ(account.getAccountDisable(), state.disabled);
}

INSTANTIATE_TEST_SUITE_P(
    StoreValues, AccountStates,
    testing::Values(StateCase{1, 2, false, 2, false}, StateCase{12, 6, false, 6, false},
                    StateCase{16, 3, false, 3, true}, StateCase{0, 0, true, 5, false},
                    StateCase{2, 0, true, 5, false}, StateCase{3, 0, true, 5, false},
                    StateCase{11, 0, true, 5, false}, StateCase{13, 0, true, 5, false},
                    StateCase{15, 0, true, 5, false}, StateCase{17, 0, true, 5, false},
                    StateCase{65537, 0, true, 5, false}, StateCase{UINT_MAX, 0, true, 5, false}),
    [](const auto& test) { return std::to_string(test.param.store); });

TEST_F(AccountRecord, State_setters_trace_the_store_value_and_then_the_field) {
    SimAccount account;
    platform_.forget();
    account.setRequestedState(12);
    account.setEnabledState(17);
    account.setAccountDisable(16);
    expectPoints(ExpectedTrace()
                     .entering(unit::account, "setRequestedState", " status=12")
                     .variable(unit::account, "setRequestedState", "_requestedState", "6")
                     .exiting(unit::account, "setRequestedState", " status=12")
                     .entering(unit::account, "setEnabledState", " enabledState=17")
                     .variable(unit::account, "setEnabledState", "_enabledState", "5")
                     .exiting(unit::account, "setEnabledState", " enabledState=17")
                     .entering(unit::account, "setAccountDisable", " accountDisable=16")
                     .variable(unit::account, "setAccountDisable", "_accountDisable", "1")
                     .exiting(unit::account, "setAccountDisable", " accountDisable=16"));
}

TEST_F(AccountRecord, State_getters_trace_the_field) {
    SimAccount account;
    account.setRequestedState(16);
    account.setEnabledState(1);
    platform_.forget();
    account.getRequestedState();
    account.getEnabledState();
    account.getAccountDisable();
    expectPoints(ExpectedTrace()
                     .method(unit::account, "getRequestedState")
                     .variable(unit::account, "getRequestedState", "_requestedState", "3")
                     .method(unit::account, "getEnabledState")
                     .variable(unit::account, "getEnabledState", "_enabledState", "2")
                     .method(unit::account, "getAccountDisable")
                     .variable(unit::account, "getAccountDisable", "_accountDisable", "0"));
}

// ---- password rules ----

TEST_F(AccountRecord, PasswordRules_0_1_7_8_3_become_2_8_4) {
    SimAccount account;
    EXPECT_FALSE(account.setPasswordRules({0, 1, 7, 8, 3}));
    EXPECT_THAT(account.getPasswordRules(), ElementsAre(2, 8, 4));
}

TEST_F(AccountRecord, PasswordRules_1_to_7_become_2_to_8) {
    SimAccount account;
    account.setPasswordRules({1, 2, 3, 4, 5, 6, 7});
    EXPECT_THAT(account.getPasswordRules(), ElementsAre(2, 3, 4, 5, 6, 7, 8));
}

TEST_F(AccountRecord, An_empty_list_of_rules_empties_the_field) {
    SimAccount account;
    account.setPasswordRules({1, 2});
    EXPECT_FALSE(account.setPasswordRules({}));
    EXPECT_THAT(account.getPasswordRules(), IsEmpty());
}

TEST_F(AccountRecord, Rules_out_of_range_are_passed_over_and_repeated_ones_kept) {
    SimAccount account;
    EXPECT_FALSE(account.setPasswordRules({UINT_MAX, 65537, 2, 2, 0}));
    EXPECT_THAT(account.getPasswordRules(), ElementsAre(3, 3));
}

TEST_F(AccountRecord, Password_rules_are_traced_by_address_without_a_variable) {
    SimAccount account;
    platform_.forget();
    account.setPasswordRules({0, 1, 9});
    account.getPasswordRules();
    expectPoints(ExpectedTrace()
                     .entering(unit::account, "setPasswordRules", " passwordRules=@")
                     .exiting(unit::account, "setPasswordRules", " passwordRules=@")
                     .method(unit::account, "getPasswordRules"));
}

} // namespace
} // namespace qelo::test
