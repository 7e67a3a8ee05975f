#include "Documents.h"

namespace qelo::cimxml {
namespace {

using cim::Type;
using cim::Value;

cim::ObjectPath named(const std::string& keys) {
    return std::get<cim::ObjectPath>(
        parameter("<INSTANCENAME CLASSNAME=\"C\">" + keys + "</INSTANCENAME>"));
}

std::string keyRefusal(const std::string& keys) {
    return refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><INSTANCENAME CLASSNAME=\"C\">" + keys +
                             "</INSTANCENAME></IPARAMVALUE>"));
}

Value key(const std::string& attributes, const std::string& text) {
    return *named("<KEYBINDING NAME=\"K\"><KEYVALUE " + attributes + ">" + text +
                  "</KEYVALUE></KEYBINDING>")
                .key("K");
}

TEST(Paths, Keys_without_type_follow_their_kind) {
    EXPECT_EQ(key("", "x"), Value::string("x"));
    EXPECT_EQ(key("VALUETYPE=\"string\"", " x "), Value::string(" x "));
    EXPECT_EQ(key("VALUETYPE=\"boolean\"", "TRUE"), Value::boolean(true));
    EXPECT_EQ(key("VALUETYPE=\"numeric\"", "5"), Value::unsignedInteger(Type::UInt64, 5));
    EXPECT_EQ(key("VALUETYPE=\"numeric\"", " -5 "), Value::signedInteger(Type::SInt64, -5));
    EXPECT_EQ(key("VALUETYPE=\"numeric\"", "2.5"), Value::real(Type::Real64, 2.5));
}

TEST(Paths, Keys_with_a_type_have_that_type) {
    EXPECT_EQ(key("VALUETYPE=\"numeric\" TYPE=\"uint8\"", "5"),
              Value::unsignedInteger(Type::UInt8, 5));
    EXPECT_EQ(key("VALUETYPE=\"string\" TYPE=\"datetime\"", "00000001000000.000000:000").type(),
              Type::DateTime);
}

TEST(Paths, A_key_may_be_a_reference) {
    const auto path = named("<KEYBINDING NAME=\"K\"><VALUE.REFERENCE><INSTANCENAME CLASSNAME=\"D\">"
                            "<KEYBINDING NAME=\"N\"><KEYVALUE>x</KEYVALUE></KEYBINDING>"
                            "</INSTANCENAME></VALUE.REFERENCE></KEYBINDING>");
    EXPECT_EQ(path.key("K")->asReference().toText(), "D.N=\"x\"");
}

TEST(Paths, A_single_key_may_stand_without_its_name) {
    const auto path = named("<KEYVALUE>x</KEYVALUE>");
    ASSERT_EQ(path.keys().size(), 1U);
    EXPECT_EQ(path.keys()[0].name, "");
    EXPECT_EQ(path.keys()[0].value, Value::string("x"));
    EXPECT_EQ(keyRefusal("<KEYVALUE>x</KEYVALUE><KEYVALUE>y</KEYVALUE>"), kNotValid);
}

TEST(Paths, A_path_may_have_no_keys) {
    EXPECT_TRUE(named("").keys().empty());
    EXPECT_EQ(named("").className(), "C");
}

TEST(Paths, Keys_keep_their_spelling_and_order) {
    const auto path = named("<KEYBINDING NAME=\"b\"><KEYVALUE>1</KEYVALUE></KEYBINDING>"
                            "<KEYBINDING NAME=\"A\"><KEYVALUE>2</KEYVALUE></KEYBINDING>");
    EXPECT_EQ(path.toText(), "C.b=\"1\",A=\"2\"");
}

TEST(Paths, Wrong_keys_are_refused) {
    const std::string one = "<KEYBINDING NAME=\"K\"><KEYVALUE>1</KEYVALUE></KEYBINDING>";
    EXPECT_EQ(keyRefusal(one), "accepted");
    EXPECT_EQ(keyRefusal(one + one), kNotValid);
    EXPECT_EQ(keyRefusal("<KEYBINDING NAME=\"K\"/>"), kNotValid);
    EXPECT_EQ(keyRefusal("<KEYBINDING><KEYVALUE/></KEYBINDING>"), kNotValid);
    EXPECT_EQ(keyRefusal("<KEYBINDING NAME=\"K\"><VALUE/></KEYBINDING>"), kNotValid);
    for (const char* attributes :
         {"VALUETYPE=\"numeric\">x", "VALUETYPE=\"numeric\">", "VALUETYPE=\"boolean\">1",
          "VALUETYPE=\"text\">x", "TYPE=\"reference\">x", "TYPE=\"uint8\">256", "TYPE=\"x\">1"}) {
        EXPECT_EQ(keyRefusal(std::string("<KEYBINDING NAME=\"K\"><KEYVALUE ") + attributes +
                             "</KEYVALUE></KEYBINDING>"),
                  kNotValid)
            << attributes;
    }
}

TEST(Paths, More_than_64_keys_are_refused) {
    const auto keys = [](int count) {
        std::string text;
        for (int i = 0; i < count; ++i) {
            text += "<KEYBINDING NAME=\"K" + std::to_string(i) +
                    "\"><KEYVALUE>1</KEYVALUE></KEYBINDING>";
        }
        return text;
    };
    EXPECT_EQ(keyRefusal(keys(64)), "accepted");
    EXPECT_EQ(keyRefusal(keys(65)), kNotValid);
}

TEST(Paths, Parts_of_a_path_must_be_there_and_in_their_place) {
    const auto reference = [](const std::string& path) {
        return refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><VALUE.REFERENCE>" + path +
                                 "</VALUE.REFERENCE></IPARAMVALUE>"));
    };
    const std::string name = "<INSTANCENAME CLASSNAME=\"C\"/>";
    for (const std::string& path :
         {std::string("<INSTANCENAME/>"), std::string("<CLASSNAME/>"),
          "<INSTANCEPATH>" + kNameSpace + name + "</INSTANCEPATH>",
          "<INSTANCEPATH>" + name + "</INSTANCEPATH>",
          "<INSTANCEPATH><NAMESPACEPATH>" + kNameSpace + "</NAMESPACEPATH>" + name +
              "</INSTANCEPATH>",
          "<LOCALINSTANCEPATH>" + name + kNameSpace + "</LOCALINSTANCEPATH>",
          "<LOCALINSTANCEPATH>" + kNameSpace + "<CLASSNAME NAME=\"C\"/></LOCALINSTANCEPATH>",
          "<LOCALCLASSPATH>" + kNameSpace + name + "</LOCALCLASSPATH>",
          "<LOCALINSTANCEPATH><LOCALNAMESPACEPATH><X/></LOCALNAMESPACEPATH>" + name +
              "</LOCALINSTANCEPATH>"}) {
        EXPECT_EQ(reference(path), kNotValid) << path;
    }
}

TEST(Paths, Path_and_instance_must_be_of_the_same_class) {
    EXPECT_EQ(refusal(intrinsic("<IPARAMVALUE NAME=\"P\"><VALUE.NAMEDINSTANCE><INSTANCENAME "
                                "CLASSNAME=\"C\"/><INSTANCE CLASSNAME=\"D\"/>"
                                "</VALUE.NAMEDINSTANCE></IPARAMVALUE>")),
              kNotValid);
}

} // namespace
} // namespace qelo::cimxml
