// Methods of an account: the command text that reaches the store, and what the client is told.
#include "AccountFixture.h"

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class AccountMethod : public AccountFixture {
protected:
    AccountMethod() { serve({accountNode("alice")}); }

    // The one command that a call with these arguments sends.
    std::string commandOf(const CMPIArgs* in) {
        expectSuccess(invoke("Method", in));
        const std::vector<std::string> commands = platform_.commands();
        EXPECT_EQ(commands.size(), 1U);
        return commands.empty() ? std::string() : commands.front();
    }

    void expectReturned() const {
        EXPECT_THAT(broker_.returnedData(), ElementsAre(Value::uint32(0)));
        EXPECT_EQ(broker_.doneCount(), 1);
        EXPECT_TRUE(exitMarked());
    }
};

// ---- the command text ----

TEST_F(AccountMethod, Without_arguments_the_command_is_the_method_name) {
    EXPECT_EQ(commandOf(broker_.makeArgs()), "Method");
    expectReturned();
}

TEST_F(AccountMethod, A_string_and_a_uint32_are_sent_with_type_and_value) {
    EXPECT_EQ(commandOf(broker_.makeArgs().string("S", "v").uint32("N", 30)),
              "Method,S:CMPI_string:v,N:CMPI_uint32:30");
}

TEST_F(AccountMethod, A_date_is_sent_in_its_CIM_form) {
    EXPECT_EQ(commandOf(broker_.makeArgs().dateTime("When", "20140307123005.000000+060")),
              "Method,When:CMPI_dateTime:20140307123005.000000+060");
}

TEST_F(AccountMethod, An_argument_of_another_type_contributes_only_its_name) {
    EXPECT_EQ(commandOf(broker_.makeArgs()
                            .boolean("B", true)
                            .uint16("U16", 5)
                            .uint8("U8", 5)
                            .uint64("U64", 5)
                            .sint32("S32", 5)
                            .add("Texts", Value::array(CMPI_string, {Value::string("a")}))
                            .string("S", "v")),
              "Method,B,U16,U8,U64,S32,Texts,S:CMPI_string:v");
}

TEST_F(AccountMethod, A_uint32_of_4294967295_is_sent_as_minus_1) {
    EXPECT_EQ(commandOf(broker_.makeArgs().uint32("N", 4294967295U)), "Method,N:CMPI_uint32:-1");
}

TEST_F(AccountMethod, A_uint32_from_2147483648_on_is_sent_negative) {
    EXPECT_EQ(commandOf(broker_.makeArgs().uint32("A", 2147483647U).uint32("B", 2147483648U)),
              "Method,A:CMPI_uint32:2147483647,B:CMPI_uint32:-2147483648");
}

TEST_F(AccountMethod, Arguments_keep_the_brokers_order) {
    EXPECT_EQ(commandOf(broker_.makeArgs().string("b", "2").string("a", "1").string("c", "3")),
              "Method,b:CMPI_string:2,a:CMPI_string:1,c:CMPI_string:3");
}

TEST_F(AccountMethod, A_value_with_separators_goes_in_as_it_is) {
    EXPECT_EQ(commandOf(broker_.makeArgs().string("S", "a,b:c")), "Method,S:CMPI_string:a,b:c");
}

TEST_F(AccountMethod, Percent_signs_are_no_formats) {
    EXPECT_EQ(commandOf(broker_.makeArgs().string("%n", "%s%n%d")), "Method,%n:CMPI_string:%s%n%d");
}

TEST_F(AccountMethod, A_null_string_is_the_empty_text) {
    EXPECT_EQ(commandOf(broker_.makeArgs().nullString("S").uint32("N", 1)),
              "Method,S:CMPI_string:,N:CMPI_uint32:1");
}

TEST_F(AccountMethod, A_string_that_a_sloppy_broker_left_out_is_the_empty_text) {
    EXPECT_EQ(commandOf(broker_.makeArgs().stringWithoutValue("S")), "Method,S:CMPI_string:");
}

TEST_F(AccountMethod, A_missing_argument_list_is_an_empty_one) {
    EXPECT_EQ(commandOf(nullptr), "Method");
}

TEST_F(AccountMethod, Any_method_name_is_passed_on) {
    expectSuccess(invoke("no such, method: at all", broker_.makeArgs()));
    EXPECT_THAT(platform_.commands(), ElementsAre("no such, method: at all"));
}

TEST_F(AccountMethod, A_command_of_1023_characters_is_whole) {
    const std::string frame = "Method,S:CMPI_string:";
    const std::string value(1023 - frame.size(), 'x');
    EXPECT_EQ(commandOf(broker_.makeArgs().string("S", value)), frame + value);
}

TEST_F(AccountMethod, A_longer_command_is_cut_at_1023_and_sent) {
    const std::string value(2000, 'x');
    const std::string whole = "Method,S:CMPI_string:" + value + ",N:CMPI_uint32:7";
    EXPECT_EQ(commandOf(broker_.makeArgs().string("S", value).uint32("N", 7)),
              whole.substr(0, 1023));
}

TEST_F(AccountMethod, A_cut_within_a_later_argument_keeps_what_fits) {
    const std::string frame = "Method,S:CMPI_string:";
    const std::string value(1023 - frame.size() - 10, 'x');
    const std::string whole = frame + value + ",Number:CMPI_uint32:7";
    EXPECT_EQ(commandOf(broker_.makeArgs().string("S", value).uint32("Number", 7)),
              whole.substr(0, 1023));
}

TEST_F(AccountMethod, A_method_name_of_2000_characters_is_cut_at_1023) {
    const std::string name(2000, 'm');
    expectSuccess(invoke(name.c_str(), broker_.makeArgs().string("S", "v")));
    EXPECT_THAT(platform_.commands(), ElementsAre(name.substr(0, 1023)));
}

// ---- the input gate ----

TEST_F(AccountMethod, Every_string_is_checked_with_an_empty_second_text) {
    commandOf(broker_.makeArgs().string("A", "one").uint32("N", 3).string("B", "two"));
    ASSERT_EQ(platform_.inputChecks().size(), 2U);
    EXPECT_EQ(platform_.inputChecks()[0].value, "one");
    EXPECT_EQ(platform_.inputChecks()[1].value, "two");
    EXPECT_EQ(platform_.inputChecks()[0].extra, "");
    EXPECT_EQ(platform_.inputChecks()[1].extra, "");
}

TEST_F(AccountMethod, The_whole_value_is_checked_also_where_it_is_cut) {
    const std::string value(5000, 'x');
    commandOf(broker_.makeArgs().string("S", value));
    ASSERT_EQ(platform_.inputChecks().size(), 1U);
    EXPECT_EQ(platform_.inputChecks()[0].value, value);
}

TEST_F(AccountMethod, A_date_is_not_checked) {
    commandOf(broker_.makeArgs().dateTime("When", "20140307123005.000000+000"));
    EXPECT_THAT(platform_.inputChecks(), IsEmpty());
}

TEST_F(AccountMethod, A_rejected_string_fails_and_writes_nothing) {
    platform_.setInputGate([](const std::string& value) { return value != "bad"; });
    expectFailure(invoke("Method", broker_.makeArgs().string("A", "bad").string("B", "good")),
                  "Execute Method Failed");
    EXPECT_THAT(platform_.commands(), IsEmpty());
    EXPECT_EQ(platform_.inputChecks().size(), 1U);
    expectReturned();
    EXPECT_THAT(failureTexts(), IsEmpty());
}

TEST_F(AccountMethod, A_rejected_string_skips_the_exit_line_of_the_executor) {
    platform_.setInputGate([](const std::string&) { return false; });
    platform_.forget();
    invoke("Method", broker_.makeArgs().string("A", "bad"));
    std::vector<std::string> ofExecutor;
    for (const std::string& point : points()) {
        if (point.find(" executeMethod ") != std::string::npos) {
            ofExecutor.push_back(point);
        }
    }
    const auto expected = ExpectedTrace()
                              .entering(unit::account, "executeMethod",
                                        " methodName=Method inParameters=@ outParameters=@")
                              .variable(unit::account, "executeMethod", "methodName", "Method");
    EXPECT_THAT(ofExecutor, testing::ElementsAreArray(expected.points()));
}

// ---- outcomes ----

TEST_F(AccountMethod, A_refused_command_fails_and_is_told) {
    platform_.refuseWrites(AdminCommand);
    expectFailure(invoke("Method", broker_.makeArgs()), "Execute Method Failed");
    expectReturned();
    EXPECT_THAT(failureTexts(), ElementsAre("Failed to Create User\n"));
    EXPECT_EQ(platform_.countStoreCalls("getProperty(74,string)->absent"), 0U);
}

TEST_F(AccountMethod, An_empty_status_fails) {
    platform_.setCommandStatus("");
    expectFailure(invoke("Method", broker_.makeArgs()), "Execute Method Failed");
    expectReturned();
    EXPECT_THAT(failureTexts(), IsEmpty());
}

TEST_F(AccountMethod, Any_other_status_succeeds_even_an_error_text) {
    platform_.setCommandStatus("ERROR: nothing worked");
    expectSuccess(invoke("Method", broker_.makeArgs()));
    expectReturned();
}

TEST_F(AccountMethod, A_status_that_cannot_be_read_back_counts_as_done) {
    platform_.makeCommandStatusUnreadable();
    expectSuccess(invoke("Method", broker_.makeArgs()));
    expectReturned();
    EXPECT_EQ(platform_.countStoreCalls("getProperty(74,string)->absent"), 1U);
}

TEST_F(AccountMethod, Without_an_administration_node_nothing_is_sent_and_it_counts_as_done) {
    platform_.reset();
    platform_.addNode(accountNode("alice"));
    expectSuccess(invoke("Method", broker_.makeArgs().string("S", "v")));
    expectReturned();
    EXPECT_THAT(platform_.commands(), IsEmpty());
    EXPECT_THAT(platform_.inputChecks(), IsEmpty());
}

TEST_F(AccountMethod, The_failure_has_no_text_when_the_broker_makes_none) {
    platform_.setCommandStatus("");
    broker_.failSlot("newString", 0, Fault::null());
    const Outcome outcome = invoke("Method", broker_.makeArgs());
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(outcome.hasMessage);
}

TEST_F(AccountMethod, The_failure_has_no_text_when_the_provider_has_no_broker) {
    platform_.setCommandStatus("");
    ProviderLibrary::instance().methodMI("SimAccountProvider", nullptr);
    const Outcome outcome = invoke("Method", broker_.makeArgs());
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(outcome.hasMessage);
    expectReturned();
}

TEST_F(AccountMethod, A_throwing_store_fails_without_CMReturnDone) {
    platform_.failOperation("setProperty", 1, StoreFault::ThrowsRuntimeError);
    expectFailure(invoke("Method", broker_.makeArgs()), storeFailureText);
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(failureTexts(), ElementsAre(storeFailureText));
}

// ---- class of the path ----

TEST_F(AccountMethod, The_class_name_is_compared_ignoring_case) {
    for (const char* name : {"ZANTH_Account", "zanth_account", "ZANTH_ACCOUNT", "Zanth_aCCount"}) {
        platform_.forget();
        expectSuccess(invoke("Method", broker_.makeArgs(), name));
        EXPECT_THAT(platform_.commands(), ElementsAre("Method")) << name;
    }
}

TEST_F(AccountMethod, On_another_class_nothing_runs_and_the_call_succeeds) {
    for (const char* name : {"ZANTH_Group", "ZANTH_Accounts", "ZANTH_Accoun", "", "CIM_Account"}) {
        platform_.forget();
        expectSuccess(invoke("Method", broker_.makeArgs().string("S", "v"), name));
        EXPECT_THAT(platform_.commands(), IsEmpty()) << name;
        EXPECT_THAT(platform_.inputChecks(), IsEmpty()) << name;
        expectReturned();
    }
}

TEST_F(AccountMethod, No_account_is_read) {
    invoke("Method", broker_.makeArgs());
    EXPECT_EQ(platform_.countStoreCalls("setFilter(1,/admin)"), 0U);
}

// ---- trace ----

TEST_F(AccountMethod, A_whole_call_leaves_exactly_these_lines) {
    platform_.setCommandStatus("Done");
    platform_.forget();
    invoke("CreateIt", broker_.makeArgs().string("S", "v"));
    const std::string params = " methodName=CreateIt inParameters=@ outParameters=@";
    expectSamePoints(points(),
                     ExpectedTrace()
                         .providerEntry(unit::accountProvider, "SimAccount_InvokeMethod")
                         .variable(unit::accountFactory, "refreshGroupUserInfo", "user_sz", "1")
                         .variable(unit::accountFactory, "refreshGroupUserInfo", "nodeSize", "1")
                         .entering(unit::account, "executeMethod", params)
                         .variable(unit::account, "executeMethod", "methodName", "CreateIt")
                         .variable(unit::account, "executeMethod", "createUserStatus", "Done")
                         .exiting(unit::account, "executeMethod", params)
                         .providerExit(unit::accountProvider, "SimAccount_InvokeMethod"));
}

TEST_F(AccountMethod, Without_an_administration_node_only_entry_and_exit_are_traced) {
    platform_.reset();
    const std::string params = " methodName=CreateIt inParameters=@ outParameters=@";
    invoke("CreateIt", broker_.makeArgs());
    expectSamePoints(points(), ExpectedTrace()
                                   .providerEntry(unit::accountProvider, "SimAccount_InvokeMethod")
                                   .entering(unit::account, "executeMethod", params)
                                   .exiting(unit::account, "executeMethod", params)
                                   .providerExit(unit::accountProvider, "SimAccount_InvokeMethod"));
}

TEST_F(AccountMethod, A_refused_command_is_traced_with_message_and_exit) {
    platform_.refuseWrites(AdminCommand);
    platform_.forget();
    const std::string params = " methodName=CreateIt inParameters=@ outParameters=@";
    invoke("CreateIt", broker_.makeArgs());
    expectSamePoints(points(),
                     ExpectedTrace()
                         .providerEntry(unit::accountProvider, "SimAccount_InvokeMethod")
                         .variable(unit::accountFactory, "refreshGroupUserInfo", "user_sz", "1")
                         .variable(unit::accountFactory, "refreshGroupUserInfo", "nodeSize", "1")
                         .entering(unit::account, "executeMethod", params)
                         .variable(unit::account, "executeMethod", "methodName", "CreateIt")
                         .message(unit::account, "executeMethod", "Failed to Create User\n")
                         .exiting(unit::account, "executeMethod", params)
                         .providerExit(unit::accountProvider, "SimAccount_InvokeMethod"));
}

TEST_F(AccountMethod, A_status_that_mentions_Password_is_never_traced) {
    platform_.setCommandStatus("Password hunter2 was too short");
    expectSuccess(invoke("ChangeIt", broker_.makeArgs().string("UserPassword", "hunter2")));
    EXPECT_THAT(platform_.commands(), ElementsAre(HasSubstr("hunter2")));
    for (const LogLine& line : platform_.lines()) {
        EXPECT_THAT(line.message, Not(HasSubstr("hunter2")));
        EXPECT_THAT(line.message, Not(HasSubstr("createUserStatus")));
    }
}

TEST_F(AccountMethod, The_search_for_Password_minds_case) {
    platform_.setCommandStatus("password changed");
    invoke("ChangeIt", broker_.makeArgs());
    EXPECT_THAT(points(), testing::Contains(HasSubstr("'createUserStatus' has Value 'password "
                                                      "changed'")));
}

TEST_F(AccountMethod, No_argument_value_is_in_any_line) {
    platform_.setInputGate([](const std::string& value) { return value != "refused-value"; });
    invoke("M", broker_.makeArgs().string("UserPassword", "hunter2").string("B", "refused-value"));
    platform_.refuseWrites(AdminCommand);
    invoke("M", broker_.makeArgs().string("UserPassword", "hunter2"));
    for (const LogLine& line : platform_.lines()) {
        EXPECT_THAT(line.message, Not(HasSubstr("hunter2")));
        EXPECT_THAT(line.message, Not(HasSubstr("refused-value")));
    }
}

} // namespace
} // namespace qelo::test
