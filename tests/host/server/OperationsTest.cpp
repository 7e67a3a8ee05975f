// What each operation asks for, and what it answers.
#include "FakeRouter.h"
#include "RequestText.h"
#include "TestSchema.h"

#include <server/LocalReferences.h>
#include <server/Operations.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

namespace {

using namespace qelo;
using namespace qelo::server;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::Optional;

class OperationsTest : public testing::Test {
protected:
    // The answer to a request.
    std::string answer(const std::string& requestText) {
        const cimxml::Request request = cimxml::parseRequest(requestText);
        const Operations operations({router_, testSchema(),
                                     [this](const std::string& user) { return user == changer_; },
                                     "host.test"});
        broker::OperationContext context;
        context.principal = "ada";
        std::string text;
        AnswerSink sink;
        sink.send = [&](std::string_view piece) {
            text += piece;
            ++pieces_;
        };
        sink.restart = [&] {
            text.clear();
            return restartable_;
        };
        operations.run(request, context, sink);
        return text;
    }
    std::string intrinsic(const std::string& method, const std::string& parameters) {
        return answer(intrinsicRequest(method, parameters));
    }

    std::shared_ptr<FakeRouter> router_ = std::make_shared<FakeRouter>();
    std::string changer_ = "ada";
    bool restartable_ = true;
    int pieces_ = 0;
};

testing::Matcher<std::string> isError(int code) {
    return HasSubstr("<ERROR CODE=\"" + std::to_string(code) + "\"");
}

TEST_F(OperationsTest, Instance_names_are_enumerated) {
    const std::string text = intrinsic("EnumerateInstanceNames", classNameParameter("TEST_Thing"));
    EXPECT_THAT(router_->asked(), ElementsAre("EnumerateInstanceNames root/test:TEST_Thing"));
    EXPECT_EQ(router_->lastContext.principal, "ada");
    EXPECT_THAT(text, HasSubstr("ID=\"4711\""));
    EXPECT_THAT(text, HasSubstr("<INSTANCENAME CLASSNAME=\"TEST_Thing\">"));
    EXPECT_THAT(text, HasSubstr(">2</KEYVALUE>"));
}

TEST_F(OperationsTest, Instances_are_enumerated_with_a_property_list) {
    const std::string list =
        "<IPARAMVALUE NAME=\"PropertyList\"><VALUE.ARRAY><VALUE>Text</VALUE></VALUE.ARRAY>"
        "</IPARAMVALUE>";
    const std::string text =
        intrinsic("EnumerateInstances", classNameParameter("TEST_Thing") + list);
    EXPECT_THAT(*router_->lastProperties, ElementsAre("Text"));
    EXPECT_THAT(text, HasSubstr("<VALUE.NAMEDINSTANCE>"));
}

TEST_F(OperationsTest, A_property_list_without_end_is_refused) {
    std::string names;
    for (int i = 0; i < 257; ++i) {
        names += "<VALUE>P" + std::to_string(i) + "</VALUE>";
    }
    EXPECT_THAT(
        intrinsic("EnumerateInstances", classNameParameter("TEST_Thing") +
                                            "<IPARAMVALUE NAME=\"PropertyList\"><VALUE.ARRAY>" +
                                            names + "</VALUE.ARRAY></IPARAMVALUE>"),
        isError(4));
    EXPECT_TRUE(router_->asked().empty());
}

TEST_F(OperationsTest, Without_a_property_list_all_properties_are_asked_for) {
    intrinsic("EnumerateInstances", classNameParameter("TEST_Base"));
    EXPECT_FALSE(router_->lastProperties);
}

TEST_F(OperationsTest, Without_deep_inheritance_only_those_of_the_class_are) {
    intrinsic("EnumerateInstances",
              classNameParameter("TEST_Base") + textParameter("DeepInheritance", "FALSE"));
    EXPECT_THAT(*router_->lastProperties, ElementsAre("Id"));
}

TEST_F(OperationsTest, One_instance_is_answered_without_its_path) {
    const std::string text = intrinsic("GetInstance", instanceNameParameter("InstanceName", "1"));
    EXPECT_THAT(text, HasSubstr("<INSTANCE CLASSNAME=\"TEST_Thing\""));
    EXPECT_THAT(text, Not(HasSubstr("NAMEDINSTANCE")));
    EXPECT_THAT(intrinsic("GetInstance", instanceNameParameter("InstanceName", "9")), isError(6));
}

TEST_F(OperationsTest, Associations_hand_on_all_filters) {
    const std::string filters =
        "<IPARAMVALUE NAME=\"AssocClass\"><CLASSNAME NAME=\"A\"/></IPARAMVALUE>"
        "<IPARAMVALUE NAME=\"ResultClass\"><CLASSNAME NAME=\"B\"/></IPARAMVALUE>" +
        textParameter("Role", "C") + textParameter("ResultRole", "D");
    const std::string source = instanceNameParameter("ObjectName", "1");
    EXPECT_THAT(intrinsic("Associators", source + filters), HasSubstr("<VALUE.OBJECTWITHPATH>"));
    EXPECT_THAT(intrinsic("AssociatorNames", source + filters), HasSubstr("<OBJECTPATH>"));
    EXPECT_THAT(router_->asked(),
                ElementsAre("Associators root/test:TEST_Thing.Id=\"1\" [A,B,C,D]",
                            "AssociatorNames root/test:TEST_Thing.Id=\"1\" [A,B,C,D]"));
}

TEST_F(OperationsTest, References_take_their_own_filters_only) {
    const std::string source = instanceNameParameter("ObjectName", "1");
    const std::string role = textParameter("Role", "C");
    EXPECT_THAT(intrinsic("References", source + role), HasSubstr("<VALUE.OBJECTWITHPATH>"));
    EXPECT_THAT(intrinsic("ReferenceNames", source + role), HasSubstr("<OBJECTPATH>"));
    EXPECT_THAT(intrinsic("References", source + textParameter("ResultRole", "D")), isError(4));
}

TEST_F(OperationsTest, Associations_of_classes_are_not_supported) {
    EXPECT_THAT(intrinsic("Associators", "<IPARAMVALUE NAME=\"ObjectName\"><CLASSNAME "
                                         "NAME=\"TEST_Thing\"/></IPARAMVALUE>"),
                isError(7));
}

TEST_F(OperationsTest, A_source_of_an_unknown_class_is_an_invalid_parameter) {
    EXPECT_THAT(intrinsic("AssociatorNames",
                          "<IPARAMVALUE NAME=\"ObjectName\"><INSTANCENAME CLASSNAME=\"NO_Such\"/>"
                          "</IPARAMVALUE>"),
                isError(4));
}

TEST_F(OperationsTest, A_method_gets_its_arguments_in_their_declared_types) {
    const std::string text = answer(
        extrinsicRequest("Weigh", "1", "<PARAMVALUE NAME=\"Grams\"><VALUE>5</VALUE></PARAMVALUE>"));
    EXPECT_THAT(router_->asked(), ElementsAre("InvokeMethod root/test:TEST_Thing.Id=\"1\" Weigh"));
    ASSERT_EQ(router_->lastArguments.size(), 1U);
    EXPECT_EQ(router_->lastArguments[0].second, cim::Value::unsignedInteger(cim::Type::UInt32, 5));
    EXPECT_THAT(text, HasSubstr(">42</VALUE>"));
    EXPECT_THAT(text, HasSubstr("forty-two"));
}

TEST_F(OperationsTest, An_argument_that_does_not_fit_never_reaches_the_provider) {
    EXPECT_THAT(answer(extrinsicRequest(
                    "Weigh", "1", "<PARAMVALUE NAME=\"Grams\"><VALUE>-5</VALUE></PARAMVALUE>")),
                isError(4));
    EXPECT_TRUE(router_->asked().empty());
}

TEST_F(OperationsTest, Who_may_not_change_anything_may_only_read) {
    changer_ = "somebody else";
    EXPECT_THAT(answer(extrinsicRequest("Weigh", "1", "")), isError(2));
    EXPECT_THAT(intrinsic("DeleteInstance", instanceNameParameter("InstanceName", "1")),
                isError(2));
    EXPECT_THAT(intrinsic("CreateInstance",
                          "<IPARAMVALUE NAME=\"NewInstance\"><INSTANCE CLASSNAME=\"TEST_Thing\"/>"
                          "</IPARAMVALUE>"),
                isError(2));
    EXPECT_THAT(intrinsic("SetProperty", instanceNameParameter("InstanceName", "1") +
                                             textParameter("PropertyName", "Text") +
                                             textParameter("NewValue", "x")),
                isError(2));
    EXPECT_TRUE(router_->asked().empty());
    EXPECT_THAT(intrinsic("GetInstance", instanceNameParameter("InstanceName", "1")),
                Not(HasSubstr("<ERROR")));
}

TEST_F(OperationsTest, Changes_go_to_the_provider) {
    intrinsic("DeleteInstance", instanceNameParameter("InstanceName", "1"));
    intrinsic("CreateInstance", "<IPARAMVALUE NAME=\"NewInstance\"><INSTANCE "
                                "CLASSNAME=\"TEST_Thing\"/></IPARAMVALUE>");
    intrinsic("ModifyInstance",
              "<IPARAMVALUE NAME=\"ModifiedInstance\"><VALUE.NAMEDINSTANCE>" +
                  instanceNameElement("1") +
                  "<INSTANCE CLASSNAME=\"TEST_Thing\"/></VALUE.NAMEDINSTANCE></IPARAMVALUE>");
    intrinsic("SetProperty", instanceNameParameter("InstanceName", "1") +
                                 textParameter("PropertyName", "Text") +
                                 textParameter("NewValue", "new"));
    intrinsic("GetProperty",
              instanceNameParameter("InstanceName", "1") + textParameter("PropertyName", "Size"));
    EXPECT_THAT(router_->asked(), ElementsAre("DeleteInstance root/test:TEST_Thing.Id=\"1\"",
                                              "CreateInstance root/test:TEST_Thing",
                                              "ModifyInstance root/test:TEST_Thing.Id=\"1\"",
                                              "SetProperty root/test:TEST_Thing.Id=\"1\" Text=new",
                                              "GetProperty root/test:TEST_Thing.Id=\"1\" Size"));
}

TEST_F(OperationsTest, A_new_value_may_be_a_list_a_reference_or_nothing) {
    const std::string property =
        instanceNameParameter("InstanceName", "1") + textParameter("PropertyName", "Text");
    intrinsic("SetProperty", property + "<IPARAMVALUE NAME=\"NewValue\"><VALUE.ARRAY><VALUE>a"
                                        "</VALUE><VALUE.NULL/></VALUE.ARRAY></IPARAMVALUE>");
    intrinsic("SetProperty", property + "<IPARAMVALUE NAME=\"NewValue\"><VALUE.REFERENCE>" +
                                 instanceNameElement("2") + "</VALUE.REFERENCE></IPARAMVALUE>");
    intrinsic("SetProperty", property);
    const std::string asked = "SetProperty root/test:TEST_Thing.Id=\"1\" Text=";
    const auto list = cim::Value::array(cim::Type::String, {cim::Value::string("a"), cim::Value()});
    EXPECT_THAT(router_->asked(),
                ElementsAre(asked + list.toText(), HasSubstr("TEST_Thing.Id=\"2\""),
                            asked + cim::Value().toText()));
}

TEST_F(OperationsTest, Without_subclasses_only_properties_of_the_class_itself_are_asked_for) {
    const std::string base =
        classNameParameter("TEST_Base") + textParameter("DeepInheritance", "false");
    intrinsic("EnumerateInstances", base);
    EXPECT_THAT(router_->lastProperties, Optional(ElementsAre("Id")));
    intrinsic("EnumerateInstances",
              base + "<IPARAMVALUE NAME=\"PropertyList\"><VALUE.ARRAY><VALUE>Text</VALUE>"
                     "<VALUE>ID</VALUE></VALUE.ARRAY></IPARAMVALUE>");
    EXPECT_THAT(router_->lastProperties, Optional(ElementsAre("ID")));
}

TEST_F(OperationsTest, A_query_goes_to_the_provider_of_the_class_behind_from) {
    intrinsic("ExecQuery", textParameter("QueryLanguage", "WQL") +
                               textParameter("Query", "select * from\n TEST_Thing where Id=1"));
    EXPECT_THAT(router_->asked(), ElementsAre("ExecQuery root/test:TEST_Thing WQL select * from\n "
                                              "TEST_Thing where Id=1"));
    EXPECT_THAT(intrinsic("ExecQuery", textParameter("QueryLanguage", "WQL") +
                                           textParameter("Query", "select nothing")),
                isError(15));
}

TEST_F(OperationsTest, Classes_come_from_the_schema) {
    const std::string all = intrinsic("GetClass", classNameParameter("test_thing") +
                                                      textParameter("LocalOnly", "false"));
    EXPECT_THAT(all, HasSubstr("<CLASS NAME=\"TEST_Thing\" SUPERCLASS=\"TEST_Base\""));
    EXPECT_THAT(all, HasSubstr("NAME=\"Id\""));
    EXPECT_THAT(intrinsic("GetClass", classNameParameter("TEST_Thing")),
                Not(HasSubstr("NAME=\"Id\"")));
    EXPECT_THAT(intrinsic("GetClass", classNameParameter("NO_Such")), isError(6));
    const std::string names = intrinsic("EnumerateClassNames", "");
    EXPECT_THAT(names, HasSubstr("TEST_Base"));
    EXPECT_THAT(names, Not(HasSubstr("TEST_Thing")));
    EXPECT_THAT(intrinsic("EnumerateClassNames", textParameter("DeepInheritance", "TRUE")),
                HasSubstr("TEST_Thing"));
    EXPECT_THAT(intrinsic("EnumerateClasses", classNameParameter("NO_Such")), isError(5));
    EXPECT_THAT(intrinsic("EnumerateQualifiers", ""), HasSubstr("NAME=\"Key\""));
    EXPECT_THAT(intrinsic("GetQualifier", textParameter("QualifierName", "key")),
                HasSubstr("<QUALIFIER.DECLARATION"));
    EXPECT_THAT(intrinsic("GetQualifier", textParameter("QualifierName", "none")), isError(6));
}

TEST_F(OperationsTest, What_is_not_known_is_not_supported) {
    for (const char* method : {"OpenEnumerateInstances", "PullInstancesWithPath", "DeleteClass",
                               "CreateClass", "SetQualifier", "Nonsense"}) {
        EXPECT_THAT(intrinsic(method, ""), isError(7)) << method;
    }
}

TEST_F(OperationsTest, An_unknown_namespace_is_an_invalid_one) {
    EXPECT_THAT(answer(intrinsicRequest("EnumerateClassNames", "", "root/other")), isError(3));
}

TEST_F(OperationsTest, Blanks_around_a_boolean_do_not_count) {
    const std::string all = intrinsic("GetClass", classNameParameter("TEST_Thing") +
                                                      textParameter("LocalOnly", " false\n"));
    EXPECT_THAT(all, HasSubstr("NAME=\"Id\""));
}

TEST_F(OperationsTest, The_only_key_of_a_class_needs_no_name) {
    intrinsic("GetInstance",
              "<IPARAMVALUE NAME=\"InstanceName\"><INSTANCENAME CLASSNAME=\"TEST_Thing\"><KEYVALUE "
              "VALUETYPE=\"string\">1</KEYVALUE></INSTANCENAME></IPARAMVALUE>");
    EXPECT_THAT(router_->asked(), ElementsAre("GetInstance root/test:TEST_Thing.Id=\"1\""));
}

TEST_F(OperationsTest, Parameters_of_the_wrong_kind_are_invalid) {
    EXPECT_THAT(intrinsic("EnumerateInstances", ""), isError(4));
    EXPECT_THAT(intrinsic("EnumerateInstances",
                          classNameParameter("TEST_Thing") + textParameter("LocalOnly", "maybe")),
                isError(4));
    EXPECT_THAT(intrinsic("EnumerateInstances",
                          classNameParameter("TEST_Thing") + textParameter("Unknown", "x")),
                isError(4));
    EXPECT_THAT(intrinsic("EnumerateInstances",
                          classNameParameter("TEST_Thing") + classNameParameter("TEST_Thing")),
                isError(4));
    EXPECT_THAT(intrinsic("GetInstance", textParameter("InstanceName", "1")), isError(4));
}

// References inside answers.

cim::ObjectPath linkTo(const std::string& host) {
    cim::ObjectPath target = FakeRouter::path(1);
    target.setHost(host);
    cim::ObjectPath link("root/test", "TEST_Link");
    link.setKey("Near", cim::Value::reference(target));
    return link;
}

TEST(LocalReferences, Lose_it_in_lists_too) {
    const cim::Value list = cim::Value::array(
        cim::Type::Reference, {*linkTo("host.test").key("Near"), *linkTo("elsewhere").key("Near")});
    cim::Instance holder(FakeRouter::path(1));
    holder.setProperty("All", list);
    const auto local = withLocalReferences(holder, "host.test");
    ASSERT_TRUE(local);
    const cim::Value::Array& found = local->property("All")->asArray();
    ASSERT_EQ(found.size(), 2U);
    EXPECT_EQ(found[0].asReference().host(), "");
    EXPECT_EQ(found[1].asReference().host(), "elsewhere");
}

TEST(LocalReferences, Lose_the_name_of_this_host_only) {
    const auto here = withLocalReferences(linkTo("host.test"), "host.test");
    ASSERT_TRUE(here);
    EXPECT_EQ(here->key("Near")->asReference().host(), "");
    EXPECT_EQ(here->key("Near")->asReference(), FakeRouter::path(1));
    const auto elsewhere = withLocalReferences(linkTo("other.test"), "host.test");
    ASSERT_TRUE(elsewhere);
    EXPECT_EQ(elsewhere->key("Near")->asReference().host(), "other.test");
}

TEST(LocalReferences, Properties_lose_it_too_and_the_rest_stays) {
    cim::Instance instance(FakeRouter::path(1));
    EXPECT_FALSE(withLocalReferences(instance, "host.test"));
    instance.setProperty("Text", cim::Value::string("host.test"));
    instance.setProperty("Far", *linkTo("HOST.test").key("Near"), "TEST_Base");
    instance.setProperty("Unset", cim::Value::null(cim::Type::Reference));
    const auto local = withLocalReferences(instance, "host.test");
    ASSERT_TRUE(local);
    EXPECT_EQ(local->property("Far")->asReference().host(), "");
    EXPECT_EQ(local->properties()[1].origin, "TEST_Base");
    EXPECT_EQ(local->property("Text")->asString(), "host.test");
    EXPECT_TRUE(local->property("Unset")->isNull());
    EXPECT_EQ(*local, instance);
}

TEST_F(OperationsTest, An_error_after_results_takes_their_place) {
    router_->count = 1000;
    router_->beforeResult = [](std::size_t index) {
        if (index == 999) {
            throw client::CimError(1, "lost in the middle");
        }
    };
    const std::string text = intrinsic("EnumerateInstances", classNameParameter("TEST_Thing"));
    EXPECT_THAT(text, isError(1));
    EXPECT_THAT(text, HasSubstr("lost in the middle"));
    EXPECT_THAT(text, Not(HasSubstr("<INSTANCE ")));
    EXPECT_GT(pieces_, 1);
}

TEST_F(OperationsTest, An_error_after_results_have_left_cuts_the_answer_short) {
    restartable_ = false;
    router_->count = 1000;
    router_->beforeResult = [](std::size_t index) {
        if (index == 999) {
            throw client::CimError(1, "lost in the middle");
        }
    };
    EXPECT_THROW(intrinsic("EnumerateInstances", classNameParameter("TEST_Thing")), AnswerCutShort);
}

} // namespace
