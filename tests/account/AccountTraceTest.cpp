// Every line that one whole request leaves in the log and in the trace, in order.
#include "AccountFixture.h"

#include <algorithm>

namespace qelo::test {
namespace {

const Unit& record = unit::account;
const Unit& factory = unit::accountFactory;
const Unit& provider = unit::accountProvider;

constexpr const char* secret = "Secret-of-the-account";

class AccountTrace : public AccountFixture {
protected:
    // What was traced, without the destructors of copies, whose number is not fixed.
    std::vector<std::string> recorded() const {
        return withoutDestructors(points(), "~SimAccount");
    }
};

void setter(ExpectedTrace& trace, const std::string& name, const std::string& piece,
            const std::string& variable, const std::string& value, const std::string& stored = "") {
    trace.entering(record, name, " " + piece + "=" + value)
        .variable(record, name, variable, stored.empty() ? value : stored)
        .exiting(record, name, " " + piece + "=" + value);
}

void getter(ExpectedTrace& trace, const std::string& name, const std::string& variable,
            const std::string& value) {
    trace.method(record, name).variable(record, name, variable, value);
}

// One date property: its getter, then the conversion of what it returned.
void date(ExpectedTrace& trace, const std::string& name, const std::string& variable,
          const std::string& value) {
    getter(trace, name, variable, value);
    trace.entering(factory, "adjustString", " value=" + value)
        .exiting(factory, "adjustString", " value=" + value);
}

// One property in the local code page.
void codepage(ExpectedTrace& trace, const std::string& name, const std::string& variable,
              const std::string& value) {
    getter(trace, name, variable, value);
    const std::string params = " target=@ targetLength=254 source=@ sourceLength=254";
    trace.entering(factory, "convertCodepage", params).exiting(factory, "convertCodepage", params);
}

ExpectedTrace refreshTrace(const std::string& count) {
    return ExpectedTrace()
        .variable(factory, "refreshGroupUserInfo", "user_sz", count)
        .variable(factory, "refreshGroupUserInfo", "nodeSize", count);
}

// Reading one full account, in the order of the properties.
ExpectedTrace recordTrace() {
    ExpectedTrace trace;
    trace.method(record, "SimAccount");
    setter(trace, "setName", "name", "_name", "alice");
    setter(trace, "setUserID", "userID", "_userID", "1001");
    trace.entering(record, "setUserPassword", " Entered function setUserPassword")
        .exiting(record, "setUserPassword", " Exiting function setUserPassword=");
    setter(trace, "setOrganizationName", "organizationName", "_organizationName", "Organisation");
    setter(trace, "setElementName", "elementName", "_elementName", "alice");
    setter(trace, "setRequestedState", "status", "_requestedState", "1", "2");
    setter(trace, "setEnabledState", "enabledState", "_enabledState", "1", "2");
    setter(trace, "setInactivityTimeout", "inactivityTimeout", "_inactivityTimeout",
           "2014-03-07 12:30:05");
    setter(trace, "setMaxLoginFailures", "maxLoginFailures", "_maxLoginFailures", "5");
    setter(trace, "setDaysExpireAfter", "daysExpireAfter", "_daysExpireAfter", "30");
    setter(trace, "setPasswordExpiration", "passwordExpiration", "_passwordExpiration",
           "2015-04-08 13:31:06");
    setter(trace, "setPasswordHistoryDepth", "passwordHistoryDepth", "_passwordHistoryDepth", "4");
    trace.entering(record, "setPasswordRules", " passwordRules=@")
        .exiting(record, "setPasswordRules", " passwordRules=@");
    setter(trace, "setHomeDirectory", "homeDirectory", "_homeDirectory", "/home/alice");
    setter(trace, "setScriptPath", "scriptPath", "_scriptPath", "/bin/bash");
    setter(trace, "setPasswordLastChanged", "passwordLastChanged", "_passwordLastChanged",
           "2013-02-06 11:29:04");
    setter(trace, "setPasswordDaysMustKeep", "passwordDaysMustKeep", "_passwordDaysMustKeep", "2");
    setter(trace, "setPasswordDaysWarnBeforeExpire", "passwordDaysWarnBeforeExpire",
           "_passwordDaysWarnBeforeExpire", "7");
    setter(trace, "setAccountDisable", "accountDisable", "_accountDisable", "1", "0");
    return trace;
}

// Constructing the factory over one full account.
ExpectedTrace factoryTrace() {
    const std::string flags = " isSen=1 isCap=0";
    const std::string vector = " vectSimAccount=@";
    const std::string cursor = " vectSimAccount=@ instrumentation=@";
    ExpectedTrace trace;
    trace.entering(factory, "SimAccountFactory", flags)
        .entering(record, "getSimAccountInstances", vector)
        .entering(record, "setVector", cursor)
        .append(recordTrace())
        .exiting(record, "setVector", cursor)
        .exiting(record, "getSimAccountInstances", vector)
        .entering(factory, "_createSimAccountMap");
    getter(trace, "getName", "_name", "alice");
    // The map makes an empty record for the name before it is assigned to.
    trace.method(record, "SimAccount")
        .exiting(factory, "_createSimAccountMap")
        .exiting(factory, "SimAccountFactory", flags)
        .entering(factory, "getNumberOfInstances")
        .variable(factory, "getNumberOfInstances", "noOfInstances", "1")
        .exiting(factory, "getNumberOfInstances");
    return trace;
}

// Assembling the instance of that account with every property.
ExpectedTrace instanceTrace() {
    const std::string params = " broker=@ ref=@ simAccount=@ properties=0 isObjPath=0 rc=@";
    ExpectedTrace trace;
    trace.entering(factory, "makeSimAccountInstance", params);
    getter(trace, "getName", "_name", "alice");
    getter(trace, "getDaysExpireAfter", "_daysExpireAfter", "30");
    getter(trace, "getUserID", "_userID", "1001");
    trace.method(record, "getUserPassword");
    getter(trace, "getOrganizationName", "_organizationName", "Organisation");
    getter(trace, "getElementName", "_elementName", "alice");
    getter(trace, "getRequestedState", "_requestedState", "2");
    getter(trace, "getEnabledState", "_enabledState", "2");
    date(trace, "getInactivityTimeout", "_inactivityTimeout", "2014-03-07 12:30:05");
    getter(trace, "getMaxLoginFailures", "_maxLoginFailures", "5");
    date(trace, "getPasswordExpiration", "_passwordExpiration", "2015-04-08 13:31:06");
    getter(trace, "getPasswordHistoryDepth", "_passwordHistoryDepth", "4");
    trace.method(record, "getPasswordRules");
    codepage(trace, "getHomeDirectory", "_homeDirectory", "/home/alice");
    codepage(trace, "getScriptPath", "_scriptPath", "/bin/bash");
    date(trace, "getPasswordLastChanged", "_passwordLastChanged", "2013-02-06 11:29:04");
    getter(trace, "getPasswordDaysMustKeep", "_passwordDaysMustKeep", "2");
    getter(trace, "getPasswordDaysWarnBeforeExpire", "_passwordDaysWarnBeforeExpire", "7");
    date(trace, "getPasswordExpiration", "_passwordExpiration", "2015-04-08 13:31:06");
    getter(trace, "getAccountDisable", "_accountDisable", "0");
    trace.exiting(factory, "makeSimAccountInstance", params);
    return trace;
}

TEST_F(AccountTrace, Enumerating_one_full_account_leaves_exactly_these_lines) {
    serve({fullAccountNode("alice")});
    enumInstances();
    const std::string params = " broker=@ ref=@ properties=0 isObjPath=0 instances=@ rc=@";
    expectSamePoints(recorded(), ExpectedTrace()
                                     .providerEntry(provider, "SimAccount_EnumInstances")
                                     .append(refreshTrace("1"))
                                     .append(factoryTrace())
                                     .entering(factory, "getAllSimAccountCMPIInstances", params)
                                     .append(instanceTrace())
                                     .exiting(factory, "getAllSimAccountCMPIInstances", params)
                                     .providerExit(provider, "SimAccount_EnumInstances")
                                     .method(factory, "~SimAccountFactory"));
}

TEST_F(AccountTrace, Enumerating_the_name_of_one_account_leaves_exactly_these_lines) {
    serve({fullAccountNode("alice")});
    enumNames();
    const std::string params = " broker=@ ref=@ objectPaths=@ status=@";
    ExpectedTrace expected;
    expected.providerEntry(provider, "SimAccount_EnumInstanceNames")
        .append(refreshTrace("1"))
        .append(factoryTrace())
        .entering(factory, "getAllSimAccountCMPIObjPaths", params);
    getter(expected, "getName", "_name", "alice");
    expected.exiting(factory, "getAllSimAccountCMPIObjPaths", params)
        .providerExit(provider, "SimAccount_EnumInstanceNames")
        .method(factory, "~SimAccountFactory");
    expectSamePoints(recorded(), expected);
}

TEST_F(AccountTrace, A_refresh_without_keys_and_nothing_else) {
    serve({accountNode("alice")});
    getInstance({});
    expectSamePoints(recorded(), ExpectedTrace()
                                     .providerEntry(provider, "SimAccount_GetInstance")
                                     .append(refreshTrace("1"))
                                     .message(provider, "SimAccount_GetInstance",
                                              "At least one key should be passed")
                                     .providerExit(provider, "SimAccount_GetInstance"));
}

TEST_F(AccountTrace, Every_operation_destroys_its_only_factory) {
    serve({accountNode("alice")});
    const auto destructions = [&] {
        const std::vector<std::string> all = points();
        return std::count_if(all.begin(), all.end(), [](const std::string& point) {
            return point.find("METHOD: ~SimAccountFactory()") != std::string::npos;
        });
    };
    enumNames();
    EXPECT_EQ(destructions(), 1);
    enumInstances();
    EXPECT_EQ(destructions(), 2);
    getInstance(accountKeys("alice"));
    EXPECT_EQ(destructions(), 3);
    getInstance(accountKeys("nobody"));
    EXPECT_EQ(destructions(), 4);
    getInstance({{"SystemName", "host.example"}});
    EXPECT_EQ(destructions(), 5);
}

TEST_F(AccountTrace, Levels_are_3000_4000_and_6000_only) {
    serve({fullAccountNode("alice")});
    enumInstances();
    getInstance(accountKeys("nobody"));
    for (const LogLine& line : platform_.lines()) {
        EXPECT_TRUE(line.level == 3000 || line.level == 4000 || line.level == 6000) << line.level;
    }
}

TEST_F(AccountTrace, Each_line_names_its_line_in_the_source_twice_in_the_same_way) {
    serve({accountNode("alice")});
    enumInstances();
    for (const LogLine& line : platform_.lines()) {
        EXPECT_GT(line.line, 0);
        if (line.file != "Trace" && line.message.find("ine: ") != std::string::npos) {
            EXPECT_NE(line.message.find("ine: " + std::to_string(line.line)), std::string::npos)
                << line.message;
        }
    }
}

TEST_F(AccountTrace, The_password_reaches_the_client_and_no_line) {
    serve({fullAccountNode("alice")});
    enumInstances();
    EXPECT_EQ(propertyOf(onlyInstance(), "UserPassword"),
              Value::array(CMPI_string, {Value::string(secret)}));
    getInstance(accountKeys("alice"));
    enumNames();
    for (const LogLine& line : platform_.lines()) {
        EXPECT_EQ(line.message.find(secret), std::string::npos) << line.message;
    }
    for (const BrokerTrace& trace : broker_.traces()) {
        EXPECT_EQ(trace.text.find(secret), std::string::npos) << trace.text;
    }
}

} // namespace
} // namespace qelo::test
