// Requests and answers for the tests, and what they are read as.
#pragma once

#include <cimxml/Request.h>
#include <cimxml/ResponseReader.h>

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace qelo::cimxml {

inline std::string message(const std::string& content) {
    return "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM CIMVERSION=\"2.0\" "
           "DTDVERSION=\"2.0\"><MESSAGE ID=\"7\" PROTOCOLVERSION=\"1.0\">" +
           content + "</MESSAGE></CIM>";
}

inline const std::string kNameSpace = "<LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE "
                                      "NAME=\"cimv2\"/></LOCALNAMESPACEPATH>";

inline std::string intrinsic(const std::string& parameters, const std::string& method = "M") {
    return message("<SIMPLEREQ><IMETHODCALL NAME=\"" + method + "\">" + kNameSpace + parameters +
                   "</IMETHODCALL></SIMPLEREQ>");
}

inline std::string extrinsic(const std::string& arguments) {
    return message("<SIMPLEREQ><METHODCALL NAME=\"M\"><LOCALCLASSPATH>" + kNameSpace +
                   "<CLASSNAME NAME=\"C\"/></LOCALCLASSPATH>" + arguments +
                   "</METHODCALL></SIMPLEREQ>");
}

// The one parameter whose content is given.
inline decltype(IntrinsicParameter::value) parameter(const std::string& content) {
    const Request request =
        parseRequest(intrinsic("<IPARAMVALUE NAME=\"P\">" + content + "</IPARAMVALUE>"));
    EXPECT_EQ(request.intrinsicParameters.size(), 1U);
    return request.intrinsicParameters.at(0).value;
}

// The one argument of an extrinsic method; `attributes` begins with a blank.
inline ExtrinsicParameter argument(const std::string& attributes, const std::string& content) {
    const Request request = parseRequest(
        extrinsic("<PARAMVALUE NAME=\"P\"" + attributes + ">" + content + "</PARAMVALUE>"));
    EXPECT_EQ(request.extrinsicParameters.size(), 1U);
    return request.extrinsicParameters.at(0);
}

// "400 request-not-valid", or "accepted".
inline std::string refusal(const std::string& body, const ReadLimits& limits = {}) {
    try {
        parseRequest(body, limits);
        return "accepted";
    } catch (const RequestError& error) {
        EXPECT_STRNE(error.what(), "");
        return std::to_string(error.httpStatus()) + " " + error.cimError();
    }
}

inline const std::string kNotValid = "400 request-not-valid";
inline const std::string kNotWellFormed = "400 request-not-well-formed";

// Everything that came out of one answer.
struct Results {
    std::vector<cim::Instance> instances;
    std::vector<cim::ObjectPath> paths;
    std::vector<cim::Class> classes;
    std::vector<std::string> classNames;
    std::vector<cim::QualifierType> qualifierTypes;
    std::vector<cim::Value> values;
    client::MethodResult method;

    ResponseSinks sinks() {
        ResponseSinks all;
        all.instance = [this](cim::Instance item) { instances.push_back(std::move(item)); };
        all.path = [this](cim::ObjectPath item) { paths.push_back(std::move(item)); };
        all.declaration = [this](cim::Class item) { classes.push_back(std::move(item)); };
        all.className = [this](const std::string& item) { classNames.push_back(item); };
        all.qualifierType = [this](cim::QualifierType item) {
            qualifierTypes.push_back(std::move(item));
        };
        all.value = [this](cim::Value item) { values.push_back(std::move(item)); };
        return all;
    }
};

// Fed in pieces of that many bytes.
inline Results readAnswer(const std::string& text, std::size_t piece = SIZE_MAX) {
    Results results;
    ResponseReader reader(results.sinks());
    for (std::size_t position = 0; position < text.size();
         position += std::min(piece, text.size() - position)) {
        reader.feed(std::string_view(text).substr(position, piece));
    }
    reader.finish();
    results.method = reader.methodResult();
    return results;
}

inline std::string answer(const std::string& content) {
    return message("<SIMPLERSP><IMETHODRESPONSE NAME=\"M\">" + content +
                   "</IMETHODRESPONSE></SIMPLERSP>");
}

inline std::string returned(const std::string& content) {
    return answer("<IRETURNVALUE>" + content + "</IRETURNVALUE>");
}

} // namespace qelo::cimxml
