#include "Program.h"

#include <nlohmann/json.hpp>

namespace qelo::cli {
namespace {

using cim::Type;
using cim::Value;

class MethodCommands : public Program {
protected:
    void SetUp() override {
        manager.methodResult.returnValue = Value::unsignedInteger(Type::UInt32, 0);
    }
};

TEST_F(MethodCommands, A_call_passes_path_method_and_arguments_in_order) {
    EXPECT_EQ(run({"cm", R"(ZANTH_Account.Name="root")", "ChangePassword", "New=secret",
                   "Days:uint32=30", "When:datetime=20140307123005.000000+000"}),
              0)
        << errors.text();
    EXPECT_EQ(manager.path.key("Name")->asString(), "root");
    EXPECT_EQ(manager.path.nameSpace(), "root/cimv2");
    EXPECT_EQ(manager.method, "ChangePassword");
    const client::Arguments expected = {
        {"New", Value::string("secret")},
        {"Days", Value::unsignedInteger(Type::UInt32, 30)},
        {"When", Value::dateTime(*cim::DateTime::parse("20140307123005.000000+000"))}};
    EXPECT_EQ(manager.arguments, expected);
}

TEST_F(MethodCommands, A_method_may_be_asked_of_a_class_and_without_arguments) {
    EXPECT_EQ(run({"cm", "ZANTH_Account", "Refresh"}), 0);
    EXPECT_TRUE(manager.path.keys().empty());
    EXPECT_TRUE(manager.arguments.empty());
}

TEST_F(MethodCommands, A_value_may_hold_any_text) {
    EXPECT_EQ(run({"cm", "C", "M", "A==b=c:d ", "B=", "C=-x", "D=--json", "E=日本", "F=[a,b]"}), 0)
        << errors.text();
    ASSERT_EQ(manager.arguments.size(), 6U);
    EXPECT_EQ(manager.arguments[0].second, Value::string("=b=c:d "));
    EXPECT_EQ(manager.arguments[1].second, Value::string(""));
    EXPECT_EQ(manager.arguments[2].second, Value::string("-x"));
    EXPECT_EQ(manager.arguments[3].second, Value::string("--json"));
    EXPECT_EQ(manager.arguments[5].second, Value::string("[a,b]"));
}

TEST_F(MethodCommands, Every_type_can_be_given) {
    EXPECT_EQ(run({"cm", "C", "M", "a:string=x", "b:boolean=TRUE", "c:uint8=255", "d:uint16=65535",
                   "e:uint32=4294967295", "f:uint64=18446744073709551615", "g:sint8=-128",
                   "h:sint16=-32768", "i:sint32=-2147483648", "j:sint64=-9223372036854775808",
                   "k:real32=0.5", "l:real64=1e300", "m:char16=x",
                   "n:datetime=00000001000000.000000:000"}),
              0)
        << errors.text();
    const Type types[] = {Type::String, Type::Boolean, Type::UInt8,  Type::UInt16,  Type::UInt32,
                          Type::UInt64, Type::SInt8,   Type::SInt16, Type::SInt32,  Type::SInt64,
                          Type::Real32, Type::Real64,  Type::Char16, Type::DateTime};
    ASSERT_EQ(manager.arguments.size(), std::size(types));
    for (std::size_t i = 0; i < std::size(types); ++i) {
        EXPECT_EQ(manager.arguments[i].second.type(), types[i]);
    }
    EXPECT_EQ(manager.arguments[5].second.asUnsigned(), UINT64_MAX);
}

TEST_F(MethodCommands, Numbers_out_of_range_are_usage_errors) {
    EXPECT_EQ(run({"cm", "C", "M", "n:uint32=4294967296"}), ExitUsage);
    EXPECT_EQ(errors.text(), "qelosim: argument \"n:uint32=4294967296\": the number is out of the "
                             "range of uint32 (see qelosim cm --help)\n");
    for (const char* argument : {"n:uint8=-1", "n:uint8=256", "n:sint8=128", "n:real32=1e39",
                                 "n:uint32=", "n:uint32=x", "n:boolean=1", "n:datetime=now"}) {
        EXPECT_EQ(run({"cm", "C", "M", argument}), ExitUsage) << argument;
    }
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(MethodCommands, Malformed_arguments_are_usage_errors) {
    for (const char* argument : {"n", "=x", ":uint8=1", "n:=1", "n:uint128=1", "n:string[]=1",
                                 "a b=1", "1a=1", "n:reference=C.K=1"}) {
        EXPECT_EQ(run({"cm", "C", "M", argument}), ExitUsage) << argument;
    }
    EXPECT_EQ(run({"cm", "C", "M", "a=1", "A=2"}), ExitUsage);
    EXPECT_EQ(run({"cm", "C", "1M"}), ExitUsage);
    EXPECT_EQ(run({"cm", "C"}), ExitUsage);
    EXPECT_EQ(run({"cm"}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(MethodCommands, The_result_is_printed_with_its_out_arguments) {
    manager.methodResult.out = {{"Message", Value::string("done\n")},
                                {"Job", Value::null(Type::Reference)}};
    EXPECT_EQ(run({"cm", "C", "M"}), 0);
    EXPECT_EQ(output.text(), "  ReturnValue = 0\n"
                             "  Message     = \"done\\n\"\n"
                             "  Job         = NULL\n");
}

TEST_F(MethodCommands, The_result_as_json_is_one_object) {
    manager.methodResult.out = {{"Message", Value::string("done")}};
    EXPECT_EQ(run({"cm", "C", "M", "--json"}), 0);
    EXPECT_EQ(nlohmann::json::parse(output.text()),
              nlohmann::json::parse(R"({"returnValue":0,"out":{"Message":"done"}})"));
}

TEST_F(MethodCommands, There_is_no_mof_of_a_result) {
    EXPECT_EQ(run({"cm", "C", "M", "--format", "mof"}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(MethodCommands, A_method_that_fails_is_an_error) {
    manager.failWith(client::CimError(1, "Execute Method Failed"));
    EXPECT_EQ(run({"cm", "C", "M"}), 1);
    EXPECT_EQ(errors.text(), "qelosim: cm: Execute Method Failed (CIM_ERR_FAILED, 1)\n");
    EXPECT_EQ(output.text(), "");
}

TEST_F(MethodCommands, The_reason_of_a_refusal_stands_behind_the_words_of_the_provider) {
    refusalReason = [] { return std::string("DeleteUser: there is no such account"); };
    manager.failWith(client::CimError(1, "Execute Method Failed"));
    EXPECT_EQ(run({"cm", "C", "M"}), 1);
    manager.failWith(client::CimError(17, "no such method"));
    EXPECT_EQ(run({"cm", "C", "M"}), 17);
    EXPECT_EQ(errors.text(), "qelosim: cm: Execute Method Failed: DeleteUser: there is no such "
                             "account (CIM_ERR_FAILED, 1)\n"
                             "qelosim: cm: no such method (CIM_ERR_METHOD_NOT_FOUND, 17)\n");
}

} // namespace
} // namespace qelo::cli
