// Values of all types, as arguments of methods and properties of instances.
#include "Documents.h"

#include <cmath>

namespace qelo::cimxml {
namespace {

using cim::Type;
using cim::Value;

Value typed(const std::string& type, const std::string& text) {
    const auto result = argument(" PARAMTYPE=\"" + type + "\"", "<VALUE>" + text + "</VALUE>");
    EXPECT_TRUE(result.typed);
    return result.value;
}

std::string typedRefusal(const std::string& type, const std::string& text) {
    return refusal(extrinsic("<PARAMVALUE NAME=\"P\" PARAMTYPE=\"" + type + "\"><VALUE>" + text +
                             "</VALUE></PARAMVALUE>"));
}

TEST(Values, Every_type_is_read) {
    EXPECT_EQ(typed("boolean", "TRUE"), Value::boolean(true));
    EXPECT_EQ(typed("boolean", "False"), Value::boolean(false));
    EXPECT_EQ(typed("uint8", "255"), Value::unsignedInteger(Type::UInt8, 255));
    EXPECT_EQ(typed("uint16", "65535"), Value::unsignedInteger(Type::UInt16, 65535));
    EXPECT_EQ(typed("UINT32", "0x10"), Value::unsignedInteger(Type::UInt32, 16));
    EXPECT_EQ(typed("uint64", "18446744073709551615"),
              Value::unsignedInteger(Type::UInt64, UINT64_MAX));
    EXPECT_EQ(typed("sint8", "-128"), Value::signedInteger(Type::SInt8, -128));
    EXPECT_EQ(typed("sint16", "-1"), Value::signedInteger(Type::SInt16, -1));
    EXPECT_EQ(typed("sint32", "+5"), Value::signedInteger(Type::SInt32, 5));
    EXPECT_EQ(typed("sint64", "-9223372036854775808"),
              Value::signedInteger(Type::SInt64, INT64_MIN));
    EXPECT_EQ(typed("real32", "1.5"), Value::real(Type::Real32, 1.5));
    EXPECT_EQ(typed("real64", "-2.5E-10"), Value::real(Type::Real64, -2.5e-10));
    EXPECT_EQ(typed("real64", "-INF"), Value::real(Type::Real64, -INFINITY));
    EXPECT_TRUE(std::isnan(typed("real32", "NaN").asReal()));
    EXPECT_EQ(typed("string", "a&lt;b"), Value::string("a<b"));
    EXPECT_EQ(typed("char16", "\xC3\xA4"), Value::unsignedInteger(Type::Char16, 0xE4));
    EXPECT_EQ(typed("char16", " "), Value::unsignedInteger(Type::Char16, ' '));
    EXPECT_EQ(typed("datetime", "20261121053000.000000+060"),
              Value::dateTime(*cim::DateTime::parse("20261121053000.000000+060")));
}

TEST(Values, White_space_counts_in_texts_only) {
    EXPECT_EQ(typed("uint8", "\n 5\t"), Value::unsignedInteger(Type::UInt8, 5));
    EXPECT_EQ(typed("boolean", " true "), Value::boolean(true));
    EXPECT_EQ(typed("char16", "\n x "), Value::unsignedInteger(Type::Char16, 'x'));
    EXPECT_EQ(typed("string", "\n a "), Value::string("\n a "));
    EXPECT_EQ(typed("string", "a<![CDATA[ <&> ]]>b"), Value::string("a <&> b"));
}

TEST(Values, What_does_not_fit_the_type_is_refused) {
    EXPECT_EQ(typedRefusal("uint8", "256"), kNotValid);
    EXPECT_EQ(typedRefusal("uint8", "-1"), kNotValid);
    EXPECT_EQ(typedRefusal("uint8", ""), kNotValid);
    EXPECT_EQ(typedRefusal("uint8", "5x"), kNotValid);
    EXPECT_EQ(typedRefusal("boolean", "yes"), kNotValid);
    EXPECT_EQ(typedRefusal("char16", "ab"), kNotValid);
    EXPECT_EQ(typedRefusal("datetime", "today"), kNotValid);
    EXPECT_EQ(typedRefusal("real32", "1e39"), kNotValid);
    EXPECT_EQ(typedRefusal("reference", "C.K=1"), kNotValid);
    EXPECT_EQ(typedRefusal("instance", "x"), kNotValid);
    EXPECT_EQ(typedRefusal("string", "<VALUE/>"), kNotValid);
}

TEST(Values, Arrays_may_hold_nulls) {
    const auto array = argument(" PARAMTYPE=\"uint8\"",
                                "<VALUE.ARRAY><VALUE>1</VALUE><VALUE.NULL/></VALUE.ARRAY>");
    EXPECT_EQ(array.value, Value::array(Type::UInt8, {Value::unsignedInteger(Type::UInt8, 1),
                                                      Value::null(Type::UInt8)}));
    EXPECT_EQ(argument(" PARAMTYPE=\"uint8\"", "<VALUE.ARRAY/>").value,
              Value::array(Type::UInt8, {}));
    EXPECT_EQ(refusal(extrinsic("<PARAMVALUE NAME=\"P\"><VALUE.ARRAY><X/></VALUE.ARRAY>"
                                "</PARAMVALUE>")),
              kNotValid);
}

TEST(Values, Arguments_without_type_are_strings_and_say_so) {
    const auto scalar = argument("", "<VALUE>5</VALUE>");
    EXPECT_EQ(scalar.value, Value::string("5"));
    EXPECT_FALSE(scalar.typed);
    const auto array = argument("", "<VALUE.ARRAY><VALUE>5</VALUE></VALUE.ARRAY>");
    EXPECT_EQ(array.value, Value::array(Type::String, {Value::string("5")}));
    EXPECT_FALSE(array.typed);
    EXPECT_FALSE(argument("", "").typed);
    EXPECT_TRUE(argument("", "").value.isNull());
}

TEST(Values, An_argument_without_value_is_null_of_its_type) {
    EXPECT_EQ(argument(" PARAMTYPE=\"uint8\"", "").value, Value::null(Type::UInt8));
    EXPECT_EQ(argument(" TYPE=\"uint8\"", "<VALUE>1</VALUE>").value,
              Value::unsignedInteger(Type::UInt8, 1))
        << "the attribute of the first versions";
    EXPECT_EQ(argument(" PARAMTYPE=\"string\" EmbeddedObject=\"instance\"", "").value,
              Value::null(Type::Instance));
}

TEST(Values, References_are_read_in_all_their_forms) {
    const auto text = [](const std::string& path) {
        const auto result = argument("", "<VALUE.REFERENCE>" + path + "</VALUE.REFERENCE>");
        EXPECT_TRUE(result.typed);
        return result.value.asReference().toText(true);
    };
    const std::string name = "<INSTANCENAME CLASSNAME=\"C\"><KEYBINDING NAME=\"K\"><KEYVALUE>x"
                             "</KEYVALUE></KEYBINDING></INSTANCENAME>";
    const std::string host = "<NAMESPACEPATH><HOST> h </HOST>" + kNameSpace + "</NAMESPACEPATH>";
    EXPECT_EQ(text(name), "C.K=\"x\"");
    EXPECT_EQ(text("<LOCALINSTANCEPATH>" + kNameSpace + name + "</LOCALINSTANCEPATH>"),
              "root/cimv2:C.K=\"x\"");
    EXPECT_EQ(text("<INSTANCEPATH>" + host + name + "</INSTANCEPATH>"), "//h/root/cimv2:C.K=\"x\"");
    const std::string className = "<CLASSNAME NAME=\"C\"/>";
    EXPECT_EQ(text(className), "C");
    EXPECT_EQ(text("<LOCALCLASSPATH>" + kNameSpace + className + "</LOCALCLASSPATH>"),
              "root/cimv2:C");
    EXPECT_EQ(text("<CLASSPATH>" + host + className + "</CLASSPATH>"), "//h/root/cimv2:C");
    EXPECT_EQ(argument(" PARAMTYPE=\"reference\"", name).value.asReference().toText(), "C.K=\"x\"");
}

TEST(Values, Arrays_of_references_are_read) {
    const auto result = argument(" PARAMTYPE=\"reference\"",
                                 "<VALUE.REFARRAY><VALUE.REFERENCE><CLASSNAME NAME=\"C\"/>"
                                 "</VALUE.REFERENCE><VALUE.NULL/></VALUE.REFARRAY>");
    ASSERT_EQ(result.value.asArray().size(), 2U);
    EXPECT_EQ(result.value.asArray()[0].asReference().className(), "C");
    EXPECT_TRUE(result.value.asArray()[1].isNull());
}

TEST(Values, Forms_that_do_not_belong_together_are_refused) {
    EXPECT_EQ(refusal(extrinsic("<PARAMVALUE NAME=\"P\" PARAMTYPE=\"uint8\"><VALUE.REFERENCE>"
                                "<CLASSNAME NAME=\"C\"/></VALUE.REFERENCE></PARAMVALUE>")),
              kNotValid);
    EXPECT_EQ(refusal(extrinsic("<PARAMVALUE NAME=\"P\"><VALUE.REFERENCE><VALUE/></VALUE.REFERENCE>"
                                "</PARAMVALUE>")),
              kNotValid);
    EXPECT_EQ(refusal(extrinsic("<PARAMVALUE NAME=\"P\"><VALUE.REFERENCE/></PARAMVALUE>")),
              kNotValid);
}

TEST(Values, An_instance_may_be_embedded_under_either_spelling) {
    const std::string document = "&lt;INSTANCE CLASSNAME=\"E\"&gt;&lt;PROPERTY NAME=\"A\" "
                                 "TYPE=\"uint8\"&gt;&lt;VALUE&gt;5&lt;/VALUE&gt;&lt;/PROPERTY&gt;"
                                 "&lt;/INSTANCE&gt;";
    for (const char* attribute : {"EmbeddedObject", "EMBEDDEDOBJECT"}) {
        for (const char* kind : {"instance", "object"}) {
            const auto result =
                argument(std::string(" PARAMTYPE=\"string\" ") + attribute + "=\"" + kind + "\"",
                         "<VALUE>\n" + document + " </VALUE>");
            EXPECT_EQ(result.value.asInstance().className(), "E");
            EXPECT_EQ(result.value.asInstance().property("A")->asUnsigned(), 5U);
        }
    }
    const auto array = argument(" PARAMTYPE=\"string\" EmbeddedObject=\"instance\"",
                                "<VALUE.ARRAY><VALUE>" + document + "</VALUE></VALUE.ARRAY>");
    EXPECT_EQ(array.value.asArray().at(0).asInstance().className(), "E");
}

TEST(Values, What_is_no_embedded_instance_is_refused) {
    const auto embedded = [](const std::string& attributes, const std::string& text) {
        return refusal(extrinsic("<PARAMVALUE NAME=\"P\" PARAMTYPE=\"string\" " + attributes +
                                 "><VALUE>" + text + "</VALUE></PARAMVALUE>"));
    };
    EXPECT_EQ(embedded("EmbeddedObject=\"instance\"", "no XML"), kNotValid);
    EXPECT_EQ(embedded("EmbeddedObject=\"instance\"", "&lt;X/&gt;"), kNotValid);
    EXPECT_EQ(embedded("EmbeddedObject=\"instance\"", "&lt;CLASS NAME=\"C\"/&gt;"), kNotValid);
    EXPECT_EQ(embedded("EmbeddedObject=\"table\"", "x"), kNotValid);
}

TEST(Values, Properties_of_all_kinds_are_read) {
    const auto instance = std::get<cim::Instance>(parameter(
        "<INSTANCE CLASSNAME=\"C\"><QUALIFIER NAME=\"Q\" TYPE=\"string\"/>"
        "<PROPERTY NAME=\"A\" TYPE=\"uint8\" CLASSORIGIN=\"B\"><QUALIFIER NAME=\"Q\" "
        "TYPE=\"string\"/><VALUE>1</VALUE></PROPERTY><PROPERTY NAME=\"N\" TYPE=\"uint8\"/>"
        "<PROPERTY.ARRAY NAME=\"L\" TYPE=\"string\"><VALUE.ARRAY><VALUE>x</VALUE></VALUE.ARRAY>"
        "</PROPERTY.ARRAY><PROPERTY.ARRAY NAME=\"M\" TYPE=\"string\"/>"
        "<PROPERTY.REFERENCE NAME=\"R\"><VALUE.REFERENCE><CLASSNAME NAME=\"D\"/></VALUE.REFERENCE>"
        "</PROPERTY.REFERENCE><PROPERTY.REFERENCE NAME=\"S\"/></INSTANCE>"));
    EXPECT_EQ(*instance.property("A"), Value::unsignedInteger(Type::UInt8, 1));
    EXPECT_EQ(instance.properties()[0].origin, "B");
    EXPECT_EQ(*instance.property("N"), Value::null(Type::UInt8));
    EXPECT_EQ(*instance.property("L"), Value::array(Type::String, {Value::string("x")}));
    EXPECT_EQ(*instance.property("M"), Value::null(Type::String, true));
    EXPECT_EQ(instance.property("R")->asReference().className(), "D");
    EXPECT_EQ(*instance.property("S"), Value::null(Type::Reference));
}

TEST(Values, Wrong_properties_are_refused) {
    const auto instance = [](const std::string& properties) {
        return refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><INSTANCE CLASSNAME=\"C\">" + properties +
                                 "</INSTANCE></IPARAMVALUE>"));
    };
    EXPECT_EQ(
        instance("<PROPERTY NAME=\"A\" TYPE=\"uint8\"/><PROPERTY NAME=\"a\" TYPE=\"uint8\"/>"),
        kNotValid)
        << "a name given twice";
    EXPECT_EQ(instance("<PROPERTY TYPE=\"uint8\"/>"), kNotValid);
    EXPECT_EQ(instance("<PROPERTY NAME=\"A\" TYPE=\"uint7\"/>"), kNotValid);
    EXPECT_EQ(instance("<PROPERTY NAME=\"A\" TYPE=\"string\"><VALUE.ARRAY/></PROPERTY>"),
              kNotValid);
    EXPECT_EQ(instance("<PROPERTY.ARRAY NAME=\"A\" TYPE=\"string\"><VALUE/></PROPERTY.ARRAY>"),
              kNotValid);
    EXPECT_EQ(instance("<PROPERTY NAME=\"A\" TYPE=\"string\"><VALUE/><VALUE/></PROPERTY>"),
              kNotValid);
    EXPECT_EQ(instance("<METHOD NAME=\"A\"/>"), kNotValid);
}

} // namespace
} // namespace qelo::cimxml
