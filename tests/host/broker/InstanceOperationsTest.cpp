// Instance operations on real provider libraries, in C++ and in C.
#include "DispatcherFixture.h"

namespace qelo::broker::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

class InstanceOperationsTest : public DispatcherTest {
protected:
    OperationContext context;
};

TEST_F(InstanceOperationsTest, Names_come_in_the_order_of_the_provider) {
    EXPECT_THAT(names("TEST_Plain"), ElementsAre("root/test:TEST_Plain.Name=\"one\""));
    EXPECT_THAT(names("TEST_Gadget"), ElementsAre("root/test:TEST_Gadget.Name=\"gadget\""));
}

TEST_F(InstanceOperationsTest, A_class_brings_its_subclasses) {
    EXPECT_THAT(names("TEST_Widget"), ElementsAre("root/test:TEST_Widget.Name=\"one\"",
                                                  "root/test:TEST_Widget.Name=\"two\"",
                                                  "root/test:TEST_Gadget.Name=\"gadget\""));
    EXPECT_EQ(names("TEST_Thing").size(), 3U);
}

TEST_F(InstanceOperationsTest, A_provider_is_asked_for_the_subclass_that_nobody_else_serves) {
    EXPECT_THAT(names("TEST_Gizmo"), ElementsAre("root/test:TEST_Gizmo.Name=\"gadget\""));
}

TEST_F(InstanceOperationsTest, Class_and_namespace_are_found_in_any_spelling) {
    connection->enumerateInstanceNames(
        {"/ROOT/Test/", "test_PLAIN"},
        [](const cim::ObjectPath& path) { EXPECT_EQ(path.className(), "TEST_Plain"); });
    EXPECT_EQ(names("test_gadget").size(), 1U);
}

TEST_F(InstanceOperationsTest, Instances_have_their_properties_and_keys) {
    const auto found = instances("TEST_Widget");
    ASSERT_EQ(found.size(), 2U); // the gadgets answer NOT_FOUND, which means none
    EXPECT_EQ(found[1].path().toText(), "root/test:TEST_Widget.Name=\"two\"");
    EXPECT_EQ(found[1].property("Color")->asString(), "blue");
    EXPECT_EQ(found[1].property("Size")->asUnsigned(), 2U);
    EXPECT_EQ(found[1].property("Name")->asString(), "two");
}

TEST_F(InstanceOperationsTest, A_property_list_limits_properties_but_not_the_keys_of_the_path) {
    const auto found = instances("TEST_Plain", std::vector<std::string>{"size"});
    ASSERT_EQ(found.size(), 1U);
    ASSERT_EQ(found[0].properties().size(), 1U);
    EXPECT_EQ(found[0].properties()[0].name, "Size");
    EXPECT_EQ(found[0].path().toText(), "root/test:TEST_Plain.Name=\"one\"");
    EXPECT_THAT(instances("TEST_Plain", std::vector<std::string>{}).at(0).properties(), IsEmpty());
}

TEST_F(InstanceOperationsTest, One_instance_is_fetched_by_its_path) {
    EXPECT_EQ(connection->getInstance(widget("two"), {}).property("Color")->asString(), "blue");
    cim::ObjectPath spelled(nameSpace, "test_widget");
    spelled.setKey("NAME", cim::Value::string("two"));
    EXPECT_EQ(connection->getInstance(spelled, {}).path(), widget("two"));
}

TEST_F(InstanceOperationsTest, An_instance_that_nobody_returned_is_not_found) {
    const auto error = errorOf([&] { connection->getInstance(widget("three"), {}); });
    EXPECT_EQ(error.code(), 6U);
    EXPECT_THAT(error.what(), HasSubstr("TEST_Widget.Name=\"three\""));
}

TEST_F(InstanceOperationsTest, A_status_becomes_an_error_with_code_and_text) {
    const auto error = errorOf([&] { connection->getInstance(classPath("TEST_Plain"), {}); });
    EXPECT_EQ(error.code(), 4U);
    EXPECT_STREQ(error.what(), "no key Name");
    const auto silent =
        errorOf([&] { dispatcher->deleteInstance(context, classPath("TEST_Plain")); });
    EXPECT_EQ(silent.code(), 7U);
    EXPECT_STREQ(silent.what(), "Plain answered CIM_ERR_NOT_SUPPORTED");
}

TEST_F(InstanceOperationsTest, An_error_after_data_comes_after_the_data) {
    cim::Instance broken(classPath("TEST_Widget"));
    broken.setProperty("Name", cim::Value::string("a broken one"));
    broken.setProperty("Color", cim::Value::string("broken"));
    dispatcher->createInstance(context, classPath("TEST_Widget"), broken);
    int seen = 0;
    const auto error = errorOf([&] {
        connection->enumerateInstances(classPath("TEST_Widget"), {},
                                       [&](const cim::Instance&) { ++seen; });
    });
    EXPECT_EQ(seen, 1);
    EXPECT_EQ(error.code(), 1U);
    EXPECT_STREQ(error.what(), "a broken widget in the store"); // on one line
}

TEST_F(InstanceOperationsTest, What_a_sink_throws_comes_out_and_stops_the_provider) {
    int seen = 0;
    EXPECT_THROW(connection->enumerateInstances(classPath("TEST_Widget"), {},
                                                [&](const cim::Instance&) {
                                                    ++seen;
                                                    throw std::length_error("enough");
                                                }),
                 std::length_error);
    EXPECT_EQ(seen, 1);
}

TEST_F(InstanceOperationsTest, Instances_are_created_modified_and_deleted) {
    cim::Instance made(classPath("TEST_Widget"));
    made.setProperty("Name", cim::Value::string("three"));
    made.setProperty("Color", cim::Value::string("green"));
    const cim::ObjectPath path =
        dispatcher->createInstance(context, classPath("TEST_Widget"), made);
    EXPECT_EQ(path, widget("three"));
    const auto again =
        errorOf([&] { dispatcher->createInstance(context, classPath("TEST_Widget"), made); });
    EXPECT_EQ(again.code(), 11U);

    cim::Instance change(path);
    change.setProperty("Size", cim::Value::unsignedInteger(cim::Type::UInt32, 9));
    dispatcher->modifyInstance(context, path, change, std::vector<std::string>{"Size"});
    const cim::Instance now = connection->getInstance(path, {});
    EXPECT_EQ(now.property("Size")->asUnsigned(), 9U);
    EXPECT_EQ(now.property("Color")->asString(), "green");

    dispatcher->deleteInstance(context, path);
    EXPECT_EQ(errorOf([&] { dispatcher->deleteInstance(context, path); }).code(), 6U);
}

TEST_F(InstanceOperationsTest, A_creation_that_tells_no_path_fails) {
    const auto error = errorOf([&] {
        dispatcher->createInstance(context, classPath("TEST_Plain"),
                                   cim::Instance(classPath("TEST_Plain")));
    });
    EXPECT_EQ(error.code(), 1U);
    EXPECT_THAT(error.what(), HasSubstr("did not tell the new path"));
}

TEST_F(InstanceOperationsTest, Queries_go_to_the_provider_of_the_class) {
    int seen = 0;
    const auto count = [&](const cim::Instance&) { ++seen; };
    dispatcher->execQuery(context, classPath("TEST_Widget"), "SELECT * FROM TEST_Widget", "WQL",
                          count);
    EXPECT_EQ(seen, 2);
    const auto query = [&](const char* text, const char* language) {
        return errorOf([&] {
                   dispatcher->execQuery(context, classPath("TEST_Widget"), text, language, count);
               })
            .code();
    };
    EXPECT_EQ(query("SELECT", "WQL"), 15U);
    EXPECT_EQ(query("SELECT", ""), 14U);
}

TEST_F(InstanceOperationsTest, An_empty_slot_is_not_supported) {
    const auto error = errorOf([&] { connection->getInstance(classPath("TEST_Gadget"), {}); });
    EXPECT_EQ(error.code(), 7U);
}

TEST_F(InstanceOperationsTest, Unknown_namespaces_and_classes_are_refused) {
    const auto code = [&](const cim::ObjectPath& path) {
        return errorOf([&] { connection->enumerateInstanceNames(path, [](const auto&) {}); })
            .code();
    };
    EXPECT_EQ(code({"root/none", "TEST_Widget"}), 3U);
    EXPECT_EQ(code({"", "TEST_Widget"}), 3U);
    EXPECT_EQ(code({nameSpace, "TEST_None"}), 5U);
    EXPECT_EQ(code({nameSpace, ""}), 5U);
    EXPECT_EQ(errorOf([&] { connection->getInstance({nameSpace, "TEST_None"}, {}); }).code(), 5U);
    EXPECT_EQ(errorOf([&] {
                  connection->enumerateInstances({"root/none", "X"}, {}, [](const auto&) {});
              }).code(),
              3U);
}

TEST_F(InstanceOperationsTest, Text_with_a_zero_byte_is_refused_before_the_provider_sees_it) {
    cim::ObjectPath path(nameSpace, "TEST_Widget");
    path.setKey("Name", cim::Value::string(std::string("one\0x", 5)));
    EXPECT_EQ(errorOf([&] { connection->getInstance(path, {}); }).code(), 4U);
}

class KnownSchemaTest : public DispatcherTest {
protected:
    DispatcherOptions options() override {
        DispatcherOptions made = DispatcherTest::options();
        made.hooks.schema.hasClass = [](const std::string&, const std::string& name) {
            return name == "TEST_Abstract";
        };
        return made;
    }
};

TEST_F(KnownSchemaTest, A_class_without_any_provider_has_no_instances) {
    EXPECT_THAT(names("TEST_Abstract"), IsEmpty());
    EXPECT_THAT(instances("TEST_Abstract"), IsEmpty());
    const cim::ObjectPath path = classPath("TEST_Abstract");
    EXPECT_EQ(errorOf([&] { connection->getInstance(path, {}); }).code(), 6U);
    EXPECT_EQ(errorOf([&] { connection->invokeMethod(path, "Do", {}); }).code(), 16U);
    EXPECT_EQ(errorOf([&] { dispatcher->deleteInstance({}, path); }).code(), 7U);
}

} // namespace
} // namespace qelo::broker::testing
