#include <client/AnswerHead.h>
#include <client/Connection.h>

#include <gtest/gtest.h>

#include <vector>

namespace qelo::client {
namespace {

AnswerHead headOf(const std::vector<std::string>& lines) {
    AnswerHead head;
    for (const std::string& line : lines) {
        head.addLine(line + "\r\n");
    }
    return head;
}

std::string verdict(const std::vector<std::string>& lines) {
    try {
        headOf(lines).requireSuccess("S");
        return "accepted";
    } catch (const CimError& error) {
        return std::to_string(error.code()) + " " + error.what();
    }
}

TEST(AnswerHead, Only_xml_with_status_200_is_an_answer) {
    EXPECT_EQ(verdict({"HTTP/1.1 200 OK", "content-type: text/xml"}), "accepted");
    EXPECT_EQ(verdict({"HTTP/1.1 200 OK", "Content-Type: Application/XML; charset=utf-8"}),
              "accepted");
    EXPECT_EQ(verdict({"HTTP/1.1 200 OK"}), "accepted") << "a server that says nothing is believed";
    EXPECT_EQ(verdict({"HTTP/1.1 200 OK", "Content-Type: text/html"}),
              "1 S is no CIM server: it answered with text/html");
}

TEST(AnswerHead, Other_states_are_told_with_what_the_server_says) {
    EXPECT_EQ(verdict({"HTTP/1.1 401 Unauthorized"}), "2 S does not accept this user and password");
    EXPECT_EQ(verdict({"HTTP/1.1 500 Internal Server Error"}),
              "1 S answered with HTTP status 500 Internal Server Error");
    EXPECT_EQ(verdict({"HTTP/1.1 400 Bad Request", "CIMError: request-not-valid",
                       "PGErrorDetail: no%20such%20thing%2"}),
              "1 S answered with HTTP status 400 Bad Request, request-not-valid, no such thing%2");
    EXPECT_EQ(verdict({"HTTP/1.1"}), "1 S answered with HTTP status 0");
    EXPECT_EQ(verdict({}), "1 S answered with HTTP status 0");
}

TEST(AnswerHead, A_later_head_replaces_an_interim_one) {
    EXPECT_EQ(verdict({"HTTP/1.1 100 Continue", "CIMError: x", "", "HTTP/1.1 200 OK"}), "accepted");
}

TEST(AnswerHead, What_a_server_contributes_is_bounded) {
    EXPECT_LT(
        verdict({"HTTP/1.1 400 " + std::string(5000, 'x'), "CIMError: " + std::string(5000, 'y'),
                 "PGErrorDetail: " + std::string(5000, 'z')})
            .size(),
        3500U);
}

TEST(AnswerHead, Fields_behind_the_body_may_report_an_error) {
    EXPECT_NO_THROW(headOf({"HTTP/1.1 200 OK"}).requireNoLateError());
    EXPECT_NO_THROW(headOf({"HTTP/1.1 200 OK", "CIMStatusCode: 0"}).requireNoLateError());
    try {
        headOf({"HTTP/1.1 200 OK", "", "CIMStatusCode: 7", "CIMStatusCodeDescription: not%20now"})
            .requireNoLateError();
        FAIL() << "no error";
    } catch (const CimError& error) {
        EXPECT_EQ(error.code(), 7U);
        EXPECT_STREQ(error.what(), "not now");
    }
}

} // namespace
} // namespace qelo::client
