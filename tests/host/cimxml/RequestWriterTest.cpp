// Requests: what a client writes, a server reads.
#include "Documents.h"
#include "Samples.h"

#include <cimxml/ElementWriter.h>
#include <cimxml/RequestWriter.h>

namespace qelo::cimxml {
namespace {

Request roundTrip(const Request& request) {
    std::string out;
    writeRequest(out, request);
    return parseRequest(out);
}

Request withParameter(decltype(IntrinsicParameter::value) value) {
    Request request;
    request.messageId = "12";
    request.protocolVersion = "1.0";
    request.method = "M";
    request.target.setNameSpace("root/cimv2");
    request.intrinsicParameters.push_back({"P", std::move(value)});
    return request;
}

template <class Content> Content returnedAs(Content value) {
    const Request read = roundTrip(withParameter(std::move(value)));
    EXPECT_EQ(read.intrinsicParameters.size(), 1U);
    EXPECT_EQ(read.intrinsicParameters.at(0).name, "P");
    return std::get<Content>(read.intrinsicParameters.at(0).value);
}

TEST(RequestWriter, The_envelope_arrives) {
    const Request read = roundTrip(withParameter({}));
    EXPECT_EQ(read.messageId, "12");
    EXPECT_EQ(read.method, "M");
    EXPECT_EQ(read.target.nameSpace(), "root/cimv2");
    EXPECT_FALSE(read.extrinsic);
    EXPECT_TRUE(std::holds_alternative<std::monostate>(read.intrinsicParameters.at(0).value));
}

TEST(RequestWriter, Intrinsic_parameters_of_every_kind_arrive) {
    EXPECT_EQ(returnedAs<std::string>(kAwkwardText), kAwkwardText);
    const TextList list = {"a", std::nullopt, "", kAwkwardText};
    EXPECT_EQ(returnedAs<TextList>(list), list);
    EXPECT_EQ(returnedAs<ClassName>({"C"}).name, "C");
    const auto path = returnedAs<cim::ObjectPath>(samplePath(""));
    EXPECT_EQ(path, samplePath(""));
    EXPECT_EQ(returnedAs<cim::ObjectPath>(samplePath()).nameSpace(), "root/cimv2");
    EXPECT_EQ(returnedAs<cim::Instance>(sampleInstance()), sampleInstance());
    const cim::Instance pathless = sampleInstance(cim::ObjectPath("", "C"));
    EXPECT_EQ(returnedAs<cim::Instance>(pathless), pathless);
    EXPECT_EQ(returnedAs<cim::Class>(sampleClass()).methods.size(), 2U);
    EXPECT_EQ(returnedAs<cim::QualifierType>(sampleQualifierType()).scopes,
              sampleQualifierType().scopes);
}

TEST(RequestWriter, Extrinsic_calls_arrive) {
    Request request;
    request.extrinsic = true;
    request.method = "Do";
    request.target = samplePath();
    request.target.setHost("h");
    const cim::Instance sample = sampleInstance();
    for (const auto& property : sample.properties()) {
        if (!(property.value.isNull() && property.value.isArray())) {
            request.extrinsicParameters.push_back({property.name, property.value, true});
        }
    }
    request.extrinsicParameters.push_back({"Untyped", cim::Value::string("5"), false});
    const Request read = roundTrip(request);
    EXPECT_TRUE(read.extrinsic);
    EXPECT_EQ(read.target, samplePath());
    EXPECT_EQ(read.target.nameSpace(), "root/cimv2");
    EXPECT_EQ(read.target.host(), "");
    ASSERT_EQ(read.extrinsicParameters.size(), request.extrinsicParameters.size());
    for (std::size_t i = 0; i < request.extrinsicParameters.size(); ++i) {
        const ExtrinsicParameter& sent = request.extrinsicParameters[i];
        EXPECT_EQ(read.extrinsicParameters[i].name, sent.name);
        EXPECT_EQ(read.extrinsicParameters[i].value, sent.value) << sent.name;
        EXPECT_EQ(read.extrinsicParameters[i].typed, sent.typed) << sent.name;
    }
}

TEST(RequestWriter, An_extrinsic_call_may_be_for_a_class) {
    Request request;
    request.extrinsic = true;
    request.method = "Do";
    request.target = cim::ObjectPath("root/cimv2", "C");
    EXPECT_EQ(roundTrip(request).target.toText(), "root/cimv2:C");
}

TEST(RequestWriter, A_key_without_name_stays_one) {
    cim::ObjectPath path("", "C");
    path.setKey("", cim::Value::string("x"));
    EXPECT_EQ(returnedAs<cim::ObjectPath>(path), path);
}

} // namespace
} // namespace qelo::cimxml
