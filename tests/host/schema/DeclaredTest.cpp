#include "SchemaFixture.h"

#include <schema/Declared.h>

namespace qelo::schema::testing {
namespace {

using cim::Type;
using cim::Value;
using ::testing::HasSubstr;
using ::testing::SizeIs;

class DeclaredTest : public SchemaTest {
protected:
    void SetUp() override {
        read(std::string(standardQualifiers) + R"(
            class Thing { [Key] string Name; [Key] uint16 Id; [Key] datetime Since; string Color;
                          [Key] boolean On; [Key] char16 Sign; [Key] sint8 Level;
                uint32 Do(uint8 Count, string Text, datetime When[], Thing ref Other); };
            [Association] class Link { [Key] Thing ref Left; [Key] Link ref Right; };)");
    }

    static cim::ObjectPath parsed(const std::string& text) {
        std::string error;
        auto path = cim::ObjectPath::parse(text, error);
        EXPECT_TRUE(path) << error;
        return path.value_or(cim::ObjectPath());
    }
    cim::ObjectPath declared(const std::string& text) {
        return withDeclaredKeys(repository, parsed(text));
    }
    // The error of a path; empty when there is none. The code must be 4.
    std::string refusalOf(const std::string& text) {
        try {
            declared(text);
        } catch (const client::CimError& error) {
            EXPECT_EQ(error.code(), 4U);
            return error.what();
        }
        return {};
    }
    std::string argumentRefusal(UntypedArgument argument) {
        try {
            declaredCall(repository, nameSpace, "Thing", "Do", {std::move(argument)});
        } catch (const client::CimError& error) {
            EXPECT_EQ(error.code(), 4U);
            return error.what();
        }
        return {};
    }
    Value argument(const std::string& name, Value value, bool typed = false) {
        return declaredCall(repository, nameSpace, "thing", "do", {{name, std::move(value), typed}})
            .arguments.at(0)
            .second;
    }
};

TEST_F(DeclaredTest, Keys_get_the_types_that_the_class_declares) {
    const cim::ObjectPath path =
        declared("root/test:thing.NAME=\"n\",Id=5,Since=\"20261121000000.000000+000\",On=true,"
                 "Sign=\"x\",Level=-3");
    EXPECT_EQ(path.className(), "thing"); // as the client spelled it
    EXPECT_EQ(path.keys()[0].name, "NAME");
    EXPECT_EQ(*path.key("Id"), Value::unsignedInteger(Type::UInt16, 5));
    EXPECT_EQ(path.key("Since")->type(), Type::DateTime);
    EXPECT_EQ(*path.key("Sign"), Value::unsignedInteger(Type::Char16, 'x'));
    EXPECT_EQ(*path.key("Level"), Value::signedInteger(Type::SInt8, -3));
    EXPECT_EQ(*path.key("On"), Value::boolean(true));
}

TEST_F(DeclaredTest, A_text_becomes_a_reference_with_declared_keys) {
    const cim::ObjectPath path = declared("root/test:Link.Left=\"Thing.Id=7\"");
    const cim::ObjectPath& left = path.key("Left")->asReference();
    EXPECT_EQ(left.nameSpace(), "root/test");
    EXPECT_EQ(*left.key("Id"), Value::unsignedInteger(Type::UInt16, 7));
}

TEST_F(DeclaredTest, What_does_not_fit_is_refused_with_the_name_of_the_key) {
    EXPECT_THAT(refusalOf("root/test:Thing.Id=65536"),
                HasSubstr("key \"Id\" must be of type uint16"));
    EXPECT_THAT(refusalOf("root/test:Thing.Id=\"5\""), HasSubstr("not string"));
    EXPECT_THAT(refusalOf("root/test:Thing.Id=-1"), HasSubstr("uint16"));
    EXPECT_THAT(refusalOf("root/test:Thing.Name=5"), HasSubstr("type string, not uint64"));
    EXPECT_THAT(refusalOf("root/test:Thing.Since=\"now\""), HasSubstr("datetime"));
    EXPECT_THAT(refusalOf("root/test:Thing.Color=\"red\""), HasSubstr("no key \"Color\""));
    EXPECT_THAT(refusalOf("root/test:Thing.None=\"red\""), HasSubstr("no key \"None\""));
    EXPECT_THAT(refusalOf("root/test:Link.Left=\"???\""), HasSubstr("must be an object path"));
    EXPECT_THAT(refusalOf("root/test:Link.Left=\"Thing.Id=\\\"x\\\"\""), HasSubstr("uint16"));
}

TEST_F(DeclaredTest, Unknown_classes_are_left_alone) {
    const cim::ObjectPath path = parsed("root/test:Other.A=5");
    EXPECT_EQ(withDeclaredKeys(repository, path), path);
    const cim::ObjectPath elsewhere = parsed("root/none:Thing.A=5");
    EXPECT_EQ(withDeclaredKeys(repository, elsewhere), elsewhere);
}

TEST_F(DeclaredTest, References_without_end_are_refused) {
    cim::ObjectPath path("root/test", "Link");
    for (int i = 0; i < 40; ++i) {
        cim::ObjectPath outer("root/test", "Link");
        outer.setKey("Right", Value::reference(path));
        path = outer;
    }
    EXPECT_THROW(withDeclaredKeys(repository, path), client::CimError);
}

TEST_F(DeclaredTest, Untyped_arguments_are_read_in_the_declared_type) {
    EXPECT_EQ(argument("count", Value::string("7")), Value::unsignedInteger(Type::UInt8, 7));
    EXPECT_EQ(argument("Text", Value::string("7")), Value::string("7"));
    const Value when =
        argument("When", Value::array(Type::String, {Value::string("20261121000000.000000+000"),
                                                     Value::null(Type::String)}));
    EXPECT_EQ(when.type(), Type::DateTime);
    EXPECT_EQ(when.asArray().size(), 2U);
    EXPECT_EQ(argument("Other", Value::string("Thing.Id=1")).asReference().key("Id")->type(),
              Type::UInt16);
}

TEST_F(DeclaredTest, Arguments_that_do_not_fit_are_refused) {
    EXPECT_THAT(argumentRefusal({"Count", Value::string("256"), false}), HasSubstr("\"Count\""));
    EXPECT_THAT(argumentRefusal({"Count", Value::unsignedInteger(Type::UInt16, 1), true}),
                HasSubstr("must be of type uint8, not uint16"));
    EXPECT_THAT(argumentRefusal({"When", Value::string("x"), false}), HasSubstr("an array"));
    EXPECT_THAT(argumentRefusal({"Text", Value::array(Type::String, {}), true}),
                HasSubstr("must not be an array"));
}

TEST_F(DeclaredTest, A_call_gets_the_names_that_the_class_declares) {
    const DeclaredCall call =
        declaredCall(repository, nameSpace, "THING", "dO", {{"cOUNT", Value::string("7"), false}});
    EXPECT_EQ(call.method, "Do");
    ASSERT_THAT(call.arguments, SizeIs(1));
    EXPECT_EQ(call.arguments[0].first, "Count");
}

TEST_F(DeclaredTest, An_argument_without_a_value_is_not_given) {
    const DeclaredCall call = declaredCall(repository, nameSpace, "Thing", "Do",
                                           {{"Count", Value::null(Type::UInt8), true},
                                            {"Text", Value::null(Type::String), false},
                                            {"Text", Value::string(""), false}});
    ASSERT_THAT(call.arguments, SizeIs(1));
    EXPECT_EQ(call.arguments[0].second, Value::string(""));
}

TEST_F(DeclaredTest, An_argument_that_the_method_has_not_is_refused_without_repeating_it) {
    EXPECT_EQ(argumentRefusal({"Unknown", Value::string("7"), false}),
              "the method Do has no such argument; it has Count, Text, When, Other");
}

TEST_F(DeclaredTest, A_method_that_the_class_has_not_is_not_found) {
    try {
        declaredCall(repository, nameSpace, "thing", "Undo", {});
        ADD_FAILURE() << "nothing was thrown";
    } catch (const client::CimError& error) {
        EXPECT_EQ(error.code(), 17U);
        EXPECT_STREQ(error.what(), "Thing has no method \"Undo\"");
    }
}

TEST_F(DeclaredTest, A_call_of_an_unknown_class_is_left_as_it_is) {
    const DeclaredCall call = declaredCall(
        repository, nameSpace, "None", "do",
        {{"Count", Value::string("x"), false}, {"Nothing", Value::null(Type::String), false}});
    EXPECT_EQ(call.method, "do");
    ASSERT_THAT(call.arguments, SizeIs(2));
    EXPECT_EQ(call.arguments[0].second, Value::string("x"));
}

} // namespace
} // namespace qelo::schema::testing
