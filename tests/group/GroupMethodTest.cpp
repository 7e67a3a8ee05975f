// Methods of a group: the command text that reaches the store, and what the client is told.
#include "GroupFixture.h"

#include <group/SimGroup.h>

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using Tesk::SimpleIdentityManagementProvider::executeGroupMethod;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

constexpr const char* executorParams = " methodName=Method inParameters=@ outParameters=@";

class GroupMethod : public GroupFixture {
protected:
    GroupMethod() { serve({groupNode("wheel")}); }

    // The one command that a call with these arguments sends.
    std::string commandOf(const CMPIArgs* in) {
        expectOk(invoke("Method", in));
        const std::vector<std::string> commands = platform_.commands();
        EXPECT_EQ(commands.size(), 1U);
        return commands.empty() ? std::string() : commands.front();
    }

    void expectReturned(CMPIUint32 value) const {
        EXPECT_THAT(broker_.returnedData(), ElementsAre(Value::uint32(value)));
        EXPECT_EQ(broker_.doneCount(), 1);
    }
};

// ---- the command text ----

TEST_F(GroupMethod, Without_arguments_the_request_is_just_the_method_name) {
    EXPECT_EQ(commandOf(broker_.makeArgs()), "Method");
    expectReturned(0);
}

TEST_F(GroupMethod, A_string_and_a_uint32_are_sent_with_type_and_value) {
    EXPECT_EQ(commandOf(broker_.makeArgs().string("A", "v").uint32("B", 5)),
              "Method,A:CMPI_string:v,B:CMPI_uint32:5");
}

TEST_F(GroupMethod, A_date_is_sent_in_its_string_form) {
    EXPECT_EQ(commandOf(broker_.makeArgs().dateTime("When", "20140307123005.000000+060")),
              "Method,When:CMPI_dateTime:20140307123005.000000+060");
}

TEST_F(GroupMethod, An_argument_of_another_type_contributes_a_comma_and_its_name) {
    EXPECT_EQ(commandOf(broker_.makeArgs()
                            .boolean("B", true)
                            .uint8("U8", 5)
                            .uint16("U16", 5)
                            .uint64("U64", 5)
                            .sint32("S32", -5)
                            .add("Texts", Value::array(CMPI_string, {Value::string("a")}))
                            .string("S", "v")),
              "Method,B,U8,U16,U64,S32,Texts,S:CMPI_string:v");
}

TEST_F(GroupMethod, A_uint32_of_4294967295_is_rendered_as_minus_1) {
    EXPECT_EQ(commandOf(broker_.makeArgs().uint32("N", 4294967295U)), "Method,N:CMPI_uint32:-1");
}

TEST_F(GroupMethod, A_uint32_from_2147483648_on_is_rendered_negative) {
    EXPECT_EQ(commandOf(broker_.makeArgs().uint32("A", 2147483647U).uint32("B", 2147483648U)),
              "Method,A:CMPI_uint32:2147483647,B:CMPI_uint32:-2147483648");
}

TEST_F(GroupMethod, Arguments_keep_the_brokers_order) {
    EXPECT_EQ(commandOf(broker_.makeArgs().string("b", "2").string("a", "1").string("c", "3")),
              "Method,b:CMPI_string:2,a:CMPI_string:1,c:CMPI_string:3");
}

TEST_F(GroupMethod, Separators_and_percent_signs_are_not_escaped) {
    EXPECT_EQ(commandOf(broker_.makeArgs().string("%n", "a,b:c%s%n")),
              "Method,%n:CMPI_string:a,b:c%s%n");
}

TEST_F(GroupMethod, A_missing_argument_list_is_an_empty_one) {
    EXPECT_EQ(commandOf(nullptr), "Method");
}

TEST_F(GroupMethod, A_string_without_a_value_is_the_empty_text) {
    EXPECT_EQ(commandOf(broker_.makeArgs().nullString("S").stringWithoutValue("T")),
              "Method,S:CMPI_string:,T:CMPI_string:");
}

TEST_F(GroupMethod, Any_method_name_is_passed_on) {
    expectOk(invoke("no such, method: at all", broker_.makeArgs()));
    EXPECT_THAT(platform_.commands(), ElementsAre("no such, method: at all"));
}

TEST_F(GroupMethod, A_request_of_1023_characters_is_whole) {
    const std::string frame = "Method,S:CMPI_string:";
    const std::string value(1023 - frame.size(), 'x');
    EXPECT_EQ(commandOf(broker_.makeArgs().string("S", value)), frame + value);
}

TEST_F(GroupMethod, A_longer_request_is_cut_at_1023_characters_and_still_written) {
    const std::string value(2000, 'x');
    const std::string whole = "Method,S:CMPI_string:" + value + ",N:CMPI_uint32:7";
    EXPECT_EQ(commandOf(broker_.makeArgs().string("S", value).uint32("N", 7)),
              whole.substr(0, 1023));
}

TEST_F(GroupMethod, Every_place_of_the_cut_keeps_what_fits) {
    const std::string frame = "Method,S:CMPI_string:";
    const std::string rest = ",Number:CMPI_uint32:77";
    for (std::size_t room = 0; room <= rest.size(); ++room) {
        platform_.forget();
        const std::string value(1023 - frame.size() - room, 'x');
        EXPECT_EQ(commandOf(broker_.makeArgs().string("S", value).uint32("Number", 77)),
                  frame + value + rest.substr(0, room));
    }
}

TEST_F(GroupMethod, A_method_name_of_2000_characters_is_cut_at_1023) {
    const std::string name(2000, 'm');
    expectOk(invoke(name.c_str(), broker_.makeArgs().string("S", "v")));
    EXPECT_THAT(platform_.commands(), ElementsAre(name.substr(0, 1023)));
}

// ---- the input gate ----

TEST_F(GroupMethod, Every_string_is_checked_with_an_empty_second_text) {
    commandOf(broker_.makeArgs().string("A", "one").uint32("N", 3).string("B", "two"));
    const std::vector<InputCheck> checks = platform_.inputChecks();
    ASSERT_EQ(checks.size(), 2U);
    EXPECT_EQ(checks[0].value, "one");
    EXPECT_EQ(checks[1].value, "two");
    EXPECT_EQ(checks[0].extra, "");
    EXPECT_EQ(checks[1].extra, "");
}

TEST_F(GroupMethod, The_whole_value_is_checked_also_where_it_is_cut) {
    const std::string value(5000, 'x');
    commandOf(broker_.makeArgs().string("S", value));
    ASSERT_EQ(platform_.inputChecks().size(), 1U);
    EXPECT_EQ(platform_.inputChecks()[0].value, value);
}

TEST_F(GroupMethod, Dates_and_names_are_not_checked) {
    commandOf(broker_.makeArgs().dateTime("When", "20140307123005.000000+000"));
    EXPECT_THAT(platform_.inputChecks(), IsEmpty());
}

TEST_F(GroupMethod, A_rejected_string_fails_writes_nothing_and_stops_at_once) {
    platform_.setInputGate([](const std::string& value) { return value != "bad"; });
    expectFailed(invoke("Method", broker_.makeArgs().string("A", "bad").string("B", "good")),
                 "Execute Method Failed");
    EXPECT_THAT(platform_.commands(), IsEmpty());
    EXPECT_EQ(platform_.inputChecks().size(), 1U);
    EXPECT_THAT(messages(), IsEmpty());
    expectReturned(1);
}

TEST_F(GroupMethod, A_rejected_string_leaves_neither_message_nor_exit_line) {
    platform_.setInputGate([](const std::string&) { return false; });
    invoke("Method", broker_.makeArgs().string("A", "bad"));
    expectSamePoints(pointsIn("executeGroupMethod"),
                     ExpectedTrace()
                         .entering(source::group, "executeGroupMethod", executorParams)
                         .variable(source::group, "executeGroupMethod", "methodName", "Method"));
}

// ---- outcomes ----

TEST_F(GroupMethod, Success_returns_0_and_traces_entry_the_name_and_exit) {
    expectOk(invoke("Method", broker_.makeArgs()));
    expectReturned(0);
    expectSamePoints(pointsIn("executeGroupMethod"),
                     ExpectedTrace()
                         .entering(source::group, "executeGroupMethod", executorParams)
                         .variable(source::group, "executeGroupMethod", "methodName", "Method")
                         .exiting(source::group, "executeGroupMethod", executorParams));
}

TEST_F(GroupMethod, A_refused_write_fails_with_the_status_code_as_return_value) {
    platform_.refuseWrites(AdminCommand);
    expectFailed(invoke("Method", broker_.makeArgs()), "Execute Method Failed");
    EXPECT_THAT(messages(), ElementsAre("Failed to Create User\n"));
    expectReturned(1);
}

TEST_F(GroupMethod, A_refused_write_is_told_at_level_6000_under_the_record_unit) {
    platform_.refuseWrites(AdminCommand);
    invoke("Method", broker_.makeArgs());
    expectSamePoints(pointsIn("executeGroupMethod"),
                     ExpectedTrace()
                         .entering(source::group, "executeGroupMethod", executorParams)
                         .variable(source::group, "executeGroupMethod", "methodName", "Method")
                         .message(source::group, "executeGroupMethod", "Failed to Create User\n")
                         .exiting(source::group, "executeGroupMethod", executorParams));
}

TEST_F(GroupMethod, The_status_text_is_not_read_back) {
    for (const char* status : {"", "Failed", "Password refused"}) {
        platform_.forget();
        platform_.setCommandStatus(status);
        expectOk(invoke("Method", broker_.makeArgs()));
        expectReturned(0);
        for (const std::string& call : platform_.storeCallTexts()) {
            EXPECT_NE(call.find("getProperty(74"), 0U) << call;
        }
        for (const std::string& point : points()) {
            EXPECT_EQ(point.find("createUserStatus"), std::string::npos) << point;
        }
    }
}

TEST_F(GroupMethod, Without_an_administration_node_it_is_reported_as_done) {
    platform_.reset();
    platform_.addNode(groupNode("wheel"));
    expectOk(invoke("Method", broker_.makeArgs().string("S", "v")));
    EXPECT_THAT(platform_.commands(), IsEmpty());
    EXPECT_THAT(platform_.inputChecks(), IsEmpty());
    expectReturned(0);
    expectSamePoints(pointsIn("executeGroupMethod"),
                     ExpectedTrace()
                         .entering(source::group, "executeGroupMethod", executorParams)
                         .exiting(source::group, "executeGroupMethod", executorParams));
}

TEST_F(GroupMethod, The_command_is_written_to_the_administration_node_once) {
    invoke("Method", broker_.makeArgs());
    EXPECT_EQ(platform_.countStoreCalls("setProperty(74,\"Method\")->1"), 1U);
    EXPECT_EQ(platform_.countStoreCalls("selectNode(17)"), 1U);
}

TEST_F(GroupMethod, The_executor_itself_answers_0_and_1) {
    EXPECT_EQ(executeGroupMethod("Method", broker_.makeArgs(), nullptr), 0);
    platform_.refuseWrites(AdminCommand);
    EXPECT_EQ(executeGroupMethod("Method", broker_.makeArgs(), nullptr), 1);
    platform_.setInputGate([](const std::string&) { return false; });
    EXPECT_EQ(executeGroupMethod("Method", broker_.makeArgs().string("S", "v"), nullptr), 1);
}

TEST_F(GroupMethod, The_executor_lets_a_store_failure_pass) {
    platform_.failOperation("setProperty", 1, StoreFault::ThrowsRuntimeError);
    EXPECT_THROW(executeGroupMethod("Method", broker_.makeArgs(), nullptr), std::runtime_error);
}

TEST_F(GroupMethod, A_store_failure_becomes_a_failed_status_without_CMReturnDone) {
    platform_.failOperation("setProperty", 1, StoreFault::ThrowsRuntimeError);
    expectFailed(invoke("Method", broker_.makeArgs()), storeFailureText);
    EXPECT_EQ(broker_.doneCount(), 0);
    expectNothingReturned();
    EXPECT_THAT(messages(), ElementsAre(storeFailureText));
}

TEST_F(GroupMethod, Without_a_broker_the_failed_status_has_no_text) {
    platform_.refuseWrites(AdminCommand);
    registerBroker(nullptr);
    expectFailed(invoke("Method", broker_.makeArgs()), "");
    expectReturned(1);
}

// ---- the class of the request ----

TEST_F(GroupMethod, The_class_may_be_spelled_in_any_letter_case) {
    for (const char* name : {"zanth_group", "ZANTH_GROUP", "ZaNtH_gRoUp"}) {
        platform_.forget();
        expectOk(invoke("Method", broker_.makeArgs(), name));
        EXPECT_THAT(platform_.commands(), ElementsAre("Method")) << name;
    }
}

TEST_F(GroupMethod, A_request_for_another_class_runs_nothing_and_succeeds) {
    platform_.refuseWrites(AdminCommand);
    for (const char* name : {"ZANTH_Account", "ZANTH_Grou", "ZANTH_Groups", "CIM_Group"}) {
        expectOk(invoke("Method", broker_.makeArgs(), name));
        EXPECT_THAT(platform_.commands(), IsEmpty()) << name;
        expectReturned(0);
    }
}

TEST_F(GroupMethod, The_provider_writes_no_line_of_its_own) {
    invoke("Method", broker_.makeArgs());
    invoke("Method", broker_.makeArgs(), "ZANTH_Account");
    platform_.refuseWrites(AdminCommand);
    invoke("Method", broker_.makeArgs());
    EXPECT_THAT(pointsOf(source::groupProvider), IsEmpty());
    EXPECT_THAT(broker_.traces(), IsEmpty());
}

TEST_F(GroupMethod, No_group_is_read_for_a_method) {
    invoke("Method", broker_.makeArgs());
    EXPECT_THAT(platform_.storeCallTexts(),
                Not(testing::Contains("getProperty(108,string)->wheel")));
}

} // namespace
} // namespace qelo::test
