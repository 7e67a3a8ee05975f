// Answers of other servers, and of those that do not behave.
#include "Documents.h"

#include <gmock/gmock.h>

namespace qelo::cimxml {
namespace {

using ::testing::HasSubstr;

const std::string kName = "<INSTANCENAME CLASSNAME=\"C\"><KEYBINDING NAME=\"K\"><KEYVALUE>x"
                          "</KEYVALUE></KEYBINDING></INSTANCENAME>";
const std::string kInstance = "<INSTANCE CLASSNAME=\"C\"><PROPERTY NAME=\"K\" TYPE=\"string\">"
                              "<VALUE>x</VALUE></PROPERTY></INSTANCE>";
const std::string kPath = "<INSTANCEPATH><NAMESPACEPATH><HOST>h</HOST>" + kNameSpace +
                          "</NAMESPACEPATH>" + kName + "</INSTANCEPATH>";
const std::string kLocalPath = "<LOCALINSTANCEPATH>" + kNameSpace + kName + "</LOCALINSTANCEPATH>";

std::string failure(const std::string& text, unsigned int code = 1) {
    try {
        readAnswer(text);
        return "none";
    } catch (const client::CimError& error) {
        EXPECT_EQ(error.code(), code);
        return error.what();
    }
}

TEST(ResponseReader, Every_form_of_an_instance_is_understood) {
    const std::pair<std::string, std::string> forms[] = {
        {kInstance, "C"},
        {"<VALUE.OBJECT>" + kInstance + "</VALUE.OBJECT>", "C"},
        {"<VALUE.NAMEDINSTANCE>" + kName + kInstance + "</VALUE.NAMEDINSTANCE>", "C.K=\"x\""},
        {"<VALUE.NAMEDOBJECT>" + kName + kInstance + "</VALUE.NAMEDOBJECT>", "C.K=\"x\""},
        {"<VALUE.INSTANCEWITHPATH>" + kPath + kInstance + "</VALUE.INSTANCEWITHPATH>",
         "//h/root/cimv2:C.K=\"x\""},
        {"<VALUE.OBJECTWITHPATH>" + kPath + kInstance + "</VALUE.OBJECTWITHPATH>",
         "//h/root/cimv2:C.K=\"x\""},
        {"<VALUE.OBJECTWITHLOCALPATH>" + kLocalPath + kInstance + "</VALUE.OBJECTWITHLOCALPATH>",
         "root/cimv2:C.K=\"x\""}};
    for (const auto& [text, path] : forms) {
        const auto results = readAnswer(returned(text));
        ASSERT_EQ(results.instances.size(), 1U) << text;
        EXPECT_EQ(results.instances[0].path().toText(true), path);
        EXPECT_EQ(results.instances[0].property("K")->asString(), "x");
    }
}

TEST(ResponseReader, Every_form_of_a_path_is_understood) {
    const auto results =
        readAnswer(returned(kName + kPath + kLocalPath + "<OBJECTPATH>" + kPath + "</OBJECTPATH>"));
    ASSERT_EQ(results.paths.size(), 4U);
    EXPECT_EQ(results.paths[3].toText(true), "//h/root/cimv2:C.K=\"x\"");
}

TEST(ResponseReader, A_class_may_stand_with_its_path) {
    const auto results = readAnswer(returned(
        "<CLASS NAME=\"C\"/><VALUE.OBJECTWITHPATH><CLASSPATH><NAMESPACEPATH><HOST>h</HOST>" +
        kNameSpace +
        "</NAMESPACEPATH><CLASSNAME NAME=\"D\"/></CLASSPATH><CLASS NAME=\"D\"/>"
        "</VALUE.OBJECTWITHPATH>"));
    ASSERT_EQ(results.classes.size(), 2U);
    EXPECT_EQ(results.classes[1].name, "D");
}

TEST(ResponseReader, Results_arrive_before_the_answer_is_complete) {
    Results results;
    ResponseReader reader(results.sinks());
    const std::string text = returned(kName);
    const std::size_t end = text.find("</INSTANCENAME>") + std::string("</INSTANCENAME>").size();
    reader.feed(std::string_view(text).substr(0, end));
    EXPECT_EQ(results.paths.size(), 1U);
}

TEST(ResponseReader, An_answer_may_be_longer_than_the_limits_of_one_result) {
    XmlLimits limits;
    limits.elements = 20;
    limits.bytes = 2000;
    Results results;
    ResponseReader reader(results.sinks(), limits);
    const std::string text = returned("@");
    reader.feed(text.substr(0, text.find('@')));
    for (int i = 0; i < 10'000; ++i) {
        reader.feed(kName);
    }
    reader.feed(text.substr(text.find('@') + 1));
    reader.finish();
    EXPECT_EQ(results.paths.size(), 10'000U);
}

TEST(ResponseReader, One_result_beyond_the_limits_is_refused) {
    XmlLimits limits;
    limits.bytes = 2000;
    ResponseReader reader(Results().sinks(), limits);
    try {
        reader.feed(returned("<CLASSNAME NAME=\"" + std::string(3000, 'x') + "\"/>"));
        FAIL() << "no error";
    } catch (const client::CimError& error) {
        EXPECT_EQ(error.code(), 1U);
        EXPECT_THAT(error.what(), HasSubstr("too large"));
    }
}

TEST(ResponseReader, An_answer_that_is_cut_short_fails_after_its_results) {
    const std::string text = returned(kName);
    for (std::size_t length = 0; length < text.size(); ++length) {
        EXPECT_THAT(failure(text.substr(0, length)), HasSubstr("cut short")) << length;
    }
    EXPECT_EQ(failure(text), "none");
}

TEST(ResponseReader, What_is_no_answer_fails_with_a_clear_text) {
    EXPECT_THAT(failure("<html><body>It works!</body></html>"), HasSubstr("CIM is expected"));
    EXPECT_THAT(failure("It works!"), HasSubstr("no XML"));
    EXPECT_THAT(failure(message("<SIMPLEREQ/>")), HasSubstr("SIMPLERSP"));
    EXPECT_THAT(failure(message("<SIMPLERSP><X/></SIMPLERSP>")), HasSubstr("X is no answer"));
    EXPECT_THAT(failure(returned("<X/>")), HasSubstr("X"));
    EXPECT_THAT(failure("<!DOCTYPE x><CIM/>"), HasSubstr("document type"));
    EXPECT_THAT(failure(returned("<INSTANCE/>")), HasSubstr("CLASSNAME"));
}

TEST(ResponseReader, A_result_of_another_kind_is_refused) {
    ResponseReader reader({});
    try {
        reader.feed(returned(kName));
        FAIL() << "no error";
    } catch (const client::CimError& error) {
        EXPECT_THAT(error.what(), HasSubstr("no result of this operation"));
    }
}

TEST(ResponseReader, What_the_receiver_throws_passes) {
    ResponseSinks sinks;
    sinks.path = [](const cim::ObjectPath&) { throw std::logic_error("full"); };
    ResponseReader reader(std::move(sinks));
    EXPECT_THROW(reader.feed(returned(kName)), std::logic_error);
}

TEST(ResponseReader, An_error_without_a_usable_code_is_a_failure) {
    EXPECT_EQ(failure(answer("<ERROR CODE=\"0\" DESCRIPTION=\"x\"/>")), "x");
    EXPECT_EQ(failure(answer("<ERROR CODE=\"abc\" DESCRIPTION=\"x\"/>")), "x");
    EXPECT_EQ(failure(answer("<ERROR/>")), "");
    EXPECT_EQ(failure(answer("<ERROR CODE=\" 7 \"/>"), 7), "");
    EXPECT_EQ(failure(answer("<ERROR CODE=\"4294967295\"/>"), 4294967295U), "");
}

TEST(ResponseReader, An_error_may_follow_results) {
    EXPECT_EQ(failure(answer("<IRETURNVALUE>" + kName +
                             "</IRETURNVALUE><ERROR CODE=\"1\" "
                             "DESCRIPTION=\"lost\"/>")),
              "lost");
}

TEST(ResponseReader, Results_elsewhere_than_in_the_return_value_do_not_count) {
    const std::string text = message("<SIMPLERSP><IMETHODRESPONSE NAME=\"M\"><X><IRETURNVALUE>" +
                                     kName + "</IRETURNVALUE></X></IMETHODRESPONSE></SIMPLERSP>");
    EXPECT_TRUE(readAnswer(text).paths.empty());
}

} // namespace
} // namespace qelo::cimxml
