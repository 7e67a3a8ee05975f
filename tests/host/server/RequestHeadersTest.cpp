// The HTTP header of a request, before its body is looked at.
#include <server/RequestHeaders.h>

#include <gtest/gtest.h>

#include <map>
#include <string>

namespace {

using qelo::cim::ObjectPath;
using qelo::cimxml::Request;
using namespace qelo::server;

constexpr std::size_t kLargest = 1000;

class HeaderTest : public testing::Test {
protected:
    HttpRefusal check(const std::string& method = "POST", const std::string& path = "/cimom") {
        return checkRequestHeader(method, path, lookup(), kLargest);
    }
    HeaderLookup lookup() {
        return [this](const char* name) -> std::optional<std::string> {
            const auto found = fields_.find(name);
            return found == fields_.end() ? std::nullopt : std::make_optional(found->second);
        };
    }
    std::map<std::string, std::string> fields_ = {{"Content-Type", "application/xml"},
                                                  {"Content-Length", "100"},
                                                  {"CIMOperation", "MethodCall"}};
};

TEST_F(HeaderTest, A_usual_one_passes) { EXPECT_FALSE(check()); }

TEST_F(HeaderTest, Only_post_is_served) {
    EXPECT_EQ(check("GET").status, 405U);
    EXPECT_EQ(check("OPTIONS").status, 405U);
    EXPECT_EQ(check("M-POST").status, 501U);
}

TEST_F(HeaderTest, Only_the_path_of_the_object_manager_is_served) {
    EXPECT_FALSE(check("POST", "/"));
    EXPECT_EQ(check("POST", "/etc/passwd").status, 404U);
    EXPECT_EQ(check("POST", "/cimom/../x").status, 404U);
}

TEST_F(HeaderTest, Content_must_be_xml_in_utf_8) {
    for (const char* type : {"text/xml", "Application/XML; charset=utf-8",
                             "text/xml;charset=\"UTF-8\"", "text/xml; x=y"}) {
        fields_["Content-Type"] = type;
        EXPECT_FALSE(check()) << type;
    }
    for (const char* type : {"", "text/html", "application/json", "text/xmlish",
                             "text/xml; charset=iso-8859-1", "text/xml; charset"}) {
        fields_["Content-Type"] = type;
        EXPECT_EQ(check().status, 415U) << type;
    }
    fields_.erase("Content-Type");
    EXPECT_EQ(check().status, 415U);
}

TEST_F(HeaderTest, Compressed_content_is_refused) {
    fields_["Content-Encoding"] = "gzip";
    EXPECT_EQ(check().status, 415U);
    fields_["Content-Encoding"] = "identity";
    EXPECT_FALSE(check());
}

TEST_F(HeaderTest, A_length_over_the_limit_is_refused) {
    fields_["Content-Length"] = "1000";
    EXPECT_FALSE(check());
    for (const char* length : {"1001", "1073741824", "99999999999999999999999"}) {
        fields_["Content-Length"] = length;
        EXPECT_EQ(check().status, 413U) << length;
    }
    for (const char* length : {"", "-1", "12x"}) {
        fields_["Content-Length"] = length;
        EXPECT_EQ(check().status, 400U) << length;
    }
}

TEST_F(HeaderTest, Only_method_calls_are_taken) {
    fields_["CIMOperation"] = "MethodResponse";
    EXPECT_EQ(check().cimError, "unsupported-operation");
    fields_.erase("CIMOperation");
    EXPECT_EQ(check().status, 400U);
}

TEST_F(HeaderTest, Batches_and_other_protocols_are_not_implemented) {
    fields_["CIMProtocolVersion"] = "1.4";
    EXPECT_FALSE(check());
    fields_["CIMProtocolVersion"] = "2.0";
    EXPECT_EQ(check().status, 501U);
    EXPECT_EQ(check().cimError, "unsupported-protocol-version");
    fields_["CIMBatch"] = "";
    EXPECT_EQ(check().cimError, "multiple-requests-unsupported");
}

class HeaderMatchTest : public HeaderTest {
protected:
    void SetUp() override {
        intrinsic_.method = "GetInstance";
        intrinsic_.target.setNameSpace("root/cimv2");
        extrinsic_.extrinsic = true;
        extrinsic_.method = "SetPassword";
        extrinsic_.target = ObjectPath("root/cimv2", "ZANTH_Account");
    }
    HttpRefusal match(const Request& request, const std::string& method,
                      const std::string& object) {
        fields_["CIMMethod"] = method;
        fields_["CIMObject"] = object;
        return checkHeaderMatch(request, lookup());
    }
    Request intrinsic_;
    Request extrinsic_;
};

TEST_F(HeaderMatchTest, An_intrinsic_method_names_the_namespace) {
    EXPECT_FALSE(match(intrinsic_, "GetInstance", "root/cimv2"));
    EXPECT_FALSE(match(intrinsic_, "getinstance", "root%2Fcimv2"));
    EXPECT_FALSE(match(intrinsic_, " GetInstance ", "/root/cimv2/"));
    EXPECT_EQ(match(intrinsic_, "DeleteInstance", "root/cimv2").cimError, "header-mismatch");
    EXPECT_EQ(match(intrinsic_, "GetInstance", "root").cimError, "header-mismatch");
    EXPECT_EQ(match(intrinsic_, "GetInstance", "root%2").cimError, "header-mismatch");
}

TEST_F(HeaderMatchTest, An_extrinsic_method_names_the_class_too) {
    EXPECT_FALSE(match(extrinsic_, "SetPassword", "root%2Fcimv2%3AZANTH_Account"));
    EXPECT_FALSE(match(extrinsic_, "SetPassword", "root/cimv2:ZANTH_Account.Name=%22root%22"));
    EXPECT_EQ(match(extrinsic_, "SetPassword", "root/cimv2").cimError, "header-mismatch");
    EXPECT_EQ(match(extrinsic_, "SetPassword", "root/cimv2:ZANTH_Group").status, 400U);
}

TEST_F(HeaderMatchTest, Both_headers_are_required) {
    EXPECT_EQ(checkHeaderMatch(intrinsic_, lookup()).cimError, "header-mismatch");
    fields_["CIMMethod"] = "GetInstance";
    EXPECT_EQ(checkHeaderMatch(intrinsic_, lookup()).cimError, "header-mismatch");
}

TEST(PercentDecoded, Bytes_and_damage) {
    EXPECT_EQ(percentDecoded("a%2Fb%c3%A4"), "a/b\xC3\xA4");
    EXPECT_EQ(percentDecoded(""), "");
    for (const char* text : {"%", "%2", "%zz", "a%4"}) {
        EXPECT_FALSE(percentDecoded(text)) << text;
    }
}

} // namespace
