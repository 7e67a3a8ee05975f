// What stands around the parameters, and the parameters of intrinsic methods.
#include "Documents.h"

namespace qelo::cimxml {
namespace {

TEST(Request, An_intrinsic_call_is_read_with_its_namespace_and_number) {
    const Request request = parseRequest(intrinsic("", "EnumerateInstances"));
    EXPECT_FALSE(request.extrinsic);
    EXPECT_EQ(request.method, "EnumerateInstances");
    EXPECT_EQ(request.messageId, "7");
    EXPECT_EQ(request.protocolVersion, "1.0");
    EXPECT_EQ(request.target.nameSpace(), "root/cimv2");
    EXPECT_EQ(request.target.className(), "");
    EXPECT_TRUE(request.intrinsicParameters.empty());
}

TEST(Request, A_namespace_may_be_one_name_with_slashes) {
    const Request request = parseRequest(
        message("<SIMPLEREQ><IMETHODCALL NAME=\"M\"><LOCALNAMESPACEPATH><NAMESPACE "
                "NAME=\"root/cimv2\"/></LOCALNAMESPACEPATH></IMETHODCALL></SIMPLEREQ>"));
    EXPECT_EQ(request.target.nameSpace(), "root/cimv2");
}

TEST(Request, Versions_may_be_missing) {
    const Request request = parseRequest("<CIM><MESSAGE><SIMPLEREQ><IMETHODCALL NAME=\"M\">" +
                                         kNameSpace + "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>");
    EXPECT_EQ(request.messageId, "");
    EXPECT_EQ(request.protocolVersion, "1.0");
}

TEST(Request, Later_minor_versions_are_served) {
    const std::string body = "<CIM CIMVERSION=\"2.9\" DTDVERSION=\"2.4\"><MESSAGE ID=\"1\" "
                             "PROTOCOLVERSION=\"1.4\"><SIMPLEREQ><IMETHODCALL NAME=\"M\">" +
                             kNameSpace + "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
    EXPECT_EQ(parseRequest(body).protocolVersion, "1.4");
}

TEST(Request, Other_major_versions_are_refused_by_name) {
    const auto body = [](const char* cim, const char* dtd, const char* protocol) {
        return std::string("<CIM CIMVERSION=\"") + cim + "\" DTDVERSION=\"" + dtd +
               "\"><MESSAGE ID=\"1\" PROTOCOLVERSION=\"" + protocol +
               "\"><SIMPLEREQ><IMETHODCALL NAME=\"M\">" + kNameSpace +
               "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
    };
    EXPECT_EQ(refusal(body("2.0", "2.0", "1.0")), "accepted");
    EXPECT_EQ(refusal(body("3.0", "2.0", "1.0")), "501 unsupported-cim-version");
    EXPECT_EQ(refusal(body("2.0", "1.0", "1.0")), "501 unsupported-dtd-version");
    EXPECT_EQ(refusal(body("2.0", "2.0", "2.0")), "501 unsupported-protocol-version");
    EXPECT_EQ(refusal(body("2.0", "2.0", "10.0")), "501 unsupported-protocol-version");
    EXPECT_EQ(refusal(body("20", "2.0", "1.0")), "501 unsupported-cim-version");
}

TEST(Request, What_this_server_does_not_do_is_named) {
    EXPECT_EQ(refusal(message("<MULTIREQ/>")), "501 multiple-requests-unsupported");
    EXPECT_EQ(refusal(message("<SIMPLEEXPREQ/>")), "501 unsupported-operation");
}

TEST(Request, Anything_else_around_the_call_is_not_valid) {
    for (const std::string& body :
         {std::string("<X/>"), std::string("<CIM/>"), std::string("<CIM><X/></CIM>"), message(""),
          message("<X/>"), message("<SIMPLERSP/>"), message("<SIMPLEREQ/>"),
          message("<SIMPLEREQ/><SIMPLEREQ/>"), message("<SIMPLEREQ><X/></SIMPLEREQ>"),
          message("<SIMPLEREQ><IMETHODCALL NAME=\"M\"/></SIMPLEREQ>"),
          message("<SIMPLEREQ><IMETHODCALL>" + kNameSpace + "</IMETHODCALL></SIMPLEREQ>"),
          message("<SIMPLEREQ><IMETHODCALL NAME=\"M\"><LOCALNAMESPACEPATH/></IMETHODCALL>"
                  "</SIMPLEREQ>"),
          message("<SIMPLEREQ><METHODCALL NAME=\"M\">" + kNameSpace + "</METHODCALL></SIMPLEREQ>"),
          intrinsic("<PARAMVALUE NAME=\"P\"/>"), intrinsic("<IPARAMVALUE/>"),
          extrinsic("<IPARAMVALUE NAME=\"P\"/>"),
          intrinsic("<IPARAMVALUE NAME=\"P\"><VALUE/><VALUE/></IPARAMVALUE>"),
          intrinsic("<IPARAMVALUE NAME=\"P\"><X/></IPARAMVALUE>")}) {
        EXPECT_EQ(refusal(body), kNotValid) << body;
    }
}

TEST(Request, A_correlator_is_passed_over) {
    const std::string call = "<IMETHODCALL NAME=\"M\">" + kNameSpace + "</IMETHODCALL>";
    EXPECT_EQ(refusal(message("<SIMPLEREQ><CORRELATOR NAME=\"a\" TYPE=\"string\"><VALUE>1</VALUE>"
                              "</CORRELATOR>" +
                              call + "</SIMPLEREQ>")),
              "accepted");
    EXPECT_EQ(refusal(message("<SIMPLEREQ>" + call + call + "</SIMPLEREQ>")), kNotValid);
}

TEST(Request, Parameters_hold_texts_lists_and_nothing) {
    EXPECT_EQ(std::get<std::string>(parameter("<VALUE>a b</VALUE>")), "a b");
    EXPECT_EQ(std::get<std::string>(parameter("<VALUE/>")), "");
    EXPECT_EQ(std::get<TextList>(parameter("<VALUE.ARRAY><VALUE>A</VALUE><VALUE.NULL/><VALUE/>"
                                           "</VALUE.ARRAY>")),
              (TextList{"A", std::nullopt, ""}));
    EXPECT_TRUE(std::get<TextList>(parameter("<VALUE.ARRAY/>")).empty());
    EXPECT_TRUE(std::holds_alternative<std::monostate>(parameter("")));
    EXPECT_TRUE(std::holds_alternative<std::monostate>(parameter("<VALUE.NULL/>")));
    EXPECT_EQ(std::get<ClassName>(parameter("<CLASSNAME NAME=\"C\"/>")).name, "C");
}

TEST(Request, Parameters_hold_paths_and_instances) {
    const std::string name = "<INSTANCENAME CLASSNAME=\"C\"><KEYBINDING NAME=\"K\">"
                             "<KEYVALUE>x</KEYVALUE></KEYBINDING></INSTANCENAME>";
    const auto path = std::get<cim::ObjectPath>(parameter(name));
    EXPECT_EQ(path.toText(), "C.K=\"x\"");
    EXPECT_EQ(
        std::get<cim::ObjectPath>(parameter("<VALUE.REFERENCE>" + name + "</VALUE.REFERENCE>"))
            .toText(),
        "C.K=\"x\"");
    const std::string body =
        "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"K\" TYPE=\"string\"><VALUE>x</VALUE></PROPERTY>"
        "</INSTANCE>";
    const auto plain = std::get<cim::Instance>(parameter(body));
    EXPECT_EQ(plain.className(), "C");
    EXPECT_EQ(plain.property("k")->asString(), "x");
    const auto named = std::get<cim::Instance>(
        parameter("<VALUE.NAMEDINSTANCE>" + name + body + "</VALUE.NAMEDINSTANCE>"));
    EXPECT_EQ(named.path(), path);
    EXPECT_EQ(named.properties().size(), 1U);
}

TEST(Request, Parameters_hold_declarations) {
    EXPECT_EQ(std::get<cim::Class>(parameter("<CLASS NAME=\"C\" SUPERCLASS=\"B\"/>")).superclass,
              "B");
    const auto type = std::get<cim::QualifierType>(
        parameter("<QUALIFIER.DECLARATION NAME=\"Key\" TYPE=\"boolean\" OVERRIDABLE=\"false\">"
                  "<SCOPE PROPERTY=\"true\" REFERENCE=\"true\"/><VALUE>FALSE</VALUE>"
                  "</QUALIFIER.DECLARATION>"));
    EXPECT_EQ(type.name, "Key");
    EXPECT_EQ(type.defaultValue, cim::Value::boolean(false));
    EXPECT_FALSE(type.flavor.overridable);
    EXPECT_TRUE(type.flavor.toSubclass);
    EXPECT_EQ(type.scopes, cim::QualifierType::ScopeProperty | cim::QualifierType::ScopeReference);
}

TEST(Request, An_extrinsic_call_is_for_a_class_or_an_instance) {
    EXPECT_EQ(parseRequest(extrinsic("")).target.toText(), "root/cimv2:C");
    EXPECT_TRUE(parseRequest(extrinsic("")).extrinsic);
    const std::string instance =
        message("<SIMPLEREQ><METHODCALL NAME=\"M\"><LOCALINSTANCEPATH>" + kNameSpace +
                "<INSTANCENAME CLASSNAME=\"C\"><KEYBINDING NAME=\"K\"><KEYVALUE "
                "VALUETYPE=\"numeric\">5</KEYVALUE></KEYBINDING></INSTANCENAME></LOCALINSTANCEPATH>"
                "</METHODCALL></SIMPLEREQ>");
    EXPECT_EQ(parseRequest(instance).target.toText(), "root/cimv2:C.K=5");
}

TEST(Request, Layout_and_prefixes_of_namespaces_do_not_count) {
    const std::string body = "\xEF\xBB\xBF<?xml version='1.0'?>\n<c:CIM xmlns:c='http://x/'>\n "
                             "<c:MESSAGE ID='1'>\n<c:SIMPLEREQ>\n\t<c:IMETHODCALL NAME='M'>\r\n"
                             "<c:LOCALNAMESPACEPATH> <c:NAMESPACE NAME='root'/> "
                             "</c:LOCALNAMESPACEPATH><!-- remark --> </c:IMETHODCALL></c:SIMPLEREQ>"
                             "</c:MESSAGE></c:CIM>\n";
    EXPECT_EQ(parseRequest(body).target.nameSpace(), "root");
}

} // namespace
} // namespace qelo::cimxml
