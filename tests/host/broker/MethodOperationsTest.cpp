// Methods and single properties on real provider libraries, and what providers do in them.
#include "DispatcherFixture.h"

namespace qelo::broker::testing {
namespace {

using ::testing::Contains;
using ::testing::HasSubstr;

class MethodOperationsTest : public DispatcherTest {};

TEST_F(MethodOperationsTest, Arguments_of_every_type_go_in_and_come_out) {
    cim::Instance embedded(classPath("TEST_Widget"));
    embedded.setProperty("Color", cim::Value::string("red"));
    const client::Arguments in = {
        {"Text", cim::Value::string("grün")},
        {"Flag", cim::Value::boolean(true)},
        {"Small", cim::Value::signedInteger(cim::Type::SInt8, -5)},
        {"Large", cim::Value::unsignedInteger(cim::Type::UInt64, UINT64_MAX)},
        {"Real", cim::Value::real(cim::Type::Real64, 0.25)},
        {"Time", cim::Value::dateTime(*cim::DateTime::parse("20240101000000.000000+000"))},
        {"Path", cim::Value::reference(widget("one"))},
        {"Object", cim::Value::instance(embedded)},
        {"None", cim::Value::null(cim::Type::UInt16)},
        {"List", cim::Value::array(cim::Type::String, {cim::Value::string("a"), cim::Value()})},
        {"NoList", cim::Value::null(cim::Type::UInt8, true)},
    };
    const client::MethodResult result = invoke("Echo", in);
    EXPECT_EQ(result.returnValue, cim::Value::unsignedInteger(cim::Type::UInt32, in.size()));
    ASSERT_EQ(result.out.size(), in.size());
    for (std::size_t i = 0; i < in.size(); ++i) {
        EXPECT_EQ(result.out[i].first, in[i].first);
        EXPECT_EQ(result.out[i].second, in[i].second) << in[i].first;
    }
}

TEST_F(MethodOperationsTest, A_provider_knows_who_asks) {
    EXPECT_EQ(invoke("WhoAmI").returnValue.asString(), "alice/admin/de");
}

TEST_F(MethodOperationsTest, An_up_call_asks_for_the_same_user) {
    EXPECT_EQ(invoke("WhoAmIByUpCall").returnValue.asString(), "alice/admin/de");
}

TEST_F(MethodOperationsTest, A_connection_without_context_is_nobody) {
    LocalConnection nobody(dispatcher);
    EXPECT_EQ(nobody.invokeMethod(widget("one"), "WhoAmI", {}).returnValue.asString(), "//");
}

TEST_F(MethodOperationsTest, Up_calls_enumerate_instances) {
    EXPECT_EQ(invoke("DescribeAll").returnValue.asString(), "red blue ");
}

TEST_F(MethodOperationsTest, Paths_and_instances_can_be_returned) {
    const cim::Value path = invoke("ReturnPath").returnValue;
    EXPECT_EQ(path.asReference(), widget("one"));
    EXPECT_EQ(path.asReference().nameSpace(), nameSpace);
    const cim::Value instance = invoke("ReturnInstance").returnValue;
    EXPECT_EQ(instance.asInstance().property("Color")->asString(), "red");
}

TEST_F(MethodOperationsTest, A_method_that_returns_nothing_returns_null) {
    const client::MethodResult result = invoke("ReturnNothing");
    EXPECT_TRUE(result.returnValue.isNull());
    EXPECT_TRUE(result.out.empty());
    EXPECT_TRUE(connection->invokeMethod(classPath("TEST_Plain"), "Any", {}).returnValue.isNull());
}

TEST_F(MethodOperationsTest, A_clone_lives_from_call_to_call) {
    EXPECT_EQ(invoke("KeepClone", {{"Text", cim::Value::string("kept")}}).returnValue.asString(),
              "nothing");
    EXPECT_EQ(invoke("KeepClone").returnValue.asString(), "kept");
}

TEST_F(MethodOperationsTest, Marks_bound_the_memory_of_a_long_call) {
    EXPECT_EQ(invoke("UseMarks").returnValue.asUnsigned(), 100U);
}

TEST_F(MethodOperationsTest, A_providers_thread_attaches_asks_and_returns) {
    EXPECT_EQ(invoke("EnumerateInThread").returnValue.asUnsigned(), 3U);
}

TEST_F(MethodOperationsTest, Exceptions_become_errors_and_the_next_call_works) {
    const auto error = errorOf([&] { invoke("Throw"); });
    EXPECT_EQ(error.code(), 1U);
    EXPECT_STREQ(error.what(), "Widget threw: out of paint");
    EXPECT_THAT(log(), Contains(": Widget threw: out of paint"));
    EXPECT_STREQ(errorOf([&] { invoke("ThrowNumber"); }).what(),
                 "Widget threw: an unknown exception");
    EXPECT_EQ(errorOf([&] { invoke("ThrowRange"); }).code(), 1U);
    EXPECT_EQ(invoke("Echo").returnValue.asUnsigned(), 0U);
}

TEST_F(MethodOperationsTest, Endless_recursion_over_the_broker_ends_in_an_error) {
    const auto error = errorOf([&] { invoke("Recurse"); });
    EXPECT_EQ(error.code(), 1U);
    EXPECT_STREQ(error.what(), "providers call each other too deeply");
    EXPECT_EQ(invoke("Echo").returnValue.asUnsigned(), 0U);
}

TEST_F(MethodOperationsTest, An_error_object_gives_the_text) {
    const auto error = errorOf([&] { invoke("FailWithErrorObject"); });
    EXPECT_EQ(error.code(), 2U);
    EXPECT_STREQ(error.what(), "told by the error object");
}

TEST_F(MethodOperationsTest, A_status_that_CIM_does_not_know_is_a_failure) {
    const auto error = errorOf([&] { invoke("OddStatus"); });
    EXPECT_EQ(error.code(), 1U);
    EXPECT_STREQ(error.what(), "Widget answered status 100");
}

TEST_F(MethodOperationsTest, Unknown_methods_and_classes_without_methods_are_refused) {
    EXPECT_EQ(errorOf([&] { invoke("echo"); }).code(), 17U); // as the client spelled it
    const auto none =
        errorOf([&] { connection->invokeMethod(classPath("TEST_Pair"), "Echo", {}); });
    EXPECT_EQ(none.code(), 16U);
    EXPECT_THAT(none.what(), HasSubstr("TEST_Pair has no provider of type Method"));
}

TEST_F(MethodOperationsTest, A_property_provider_sets_and_gets) {
    const OperationContext context;
    dispatcher->setProperty(context, widget("one"), "Level",
                            cim::Value::unsignedInteger(cim::Type::UInt32, 4));
    EXPECT_EQ(dispatcher->getProperty(context, widget("one"), "Level").asUnsigned(), 4U);
    EXPECT_EQ(errorOf([&] { dispatcher->getProperty(context, widget("one"), "None"); }).code(),
              12U);
    EXPECT_EQ(errorOf([&] {
                  dispatcher->setProperty(context, widget("one"), "Level",
                                          cim::Value::string("high"));
              }).code(),
              13U);
}

TEST_F(MethodOperationsTest, Without_a_property_provider_the_instance_is_changed_and_read) {
    const OperationContext context;
    cim::ObjectPath path("root/second", "TEST_Widget");
    path.setKey("Name", cim::Value::string("one"));
    dispatcher->setProperty(context, path, "Color", cim::Value::string("white"));
    EXPECT_EQ(dispatcher->getProperty(context, path, "Color").asString(), "white");
    EXPECT_EQ(errorOf([&] { dispatcher->getProperty(context, path, "None"); }).code(), 12U);
}

TEST_F(MethodOperationsTest, Indications_are_accepted_and_dropped) {
    EXPECT_NO_THROW(
        dispatcher->deliverIndication({}, nameSpace, cim::Instance(classPath("TEST_Event"))));
}

} // namespace
} // namespace qelo::broker::testing
