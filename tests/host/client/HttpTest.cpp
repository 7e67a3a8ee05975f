// HTTP around the operations, and servers that do not behave.
#include "ConnectionFixture.h"

#include <cstdlib>

namespace qelo::client {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

class Http : public ConnectionFixture {
protected:
    static std::string emptyAnswer() {
        std::string body;
        const cimxml::ResponseWriter writer({}, "h", "n");
        writer.begin(body);
        writer.end(body);
        return body;
    }
    std::string address() const { return options.server.text(); }
};

TEST_F(Http, A_request_is_what_the_standard_asks_for) {
    serve(xmlAnswer(emptyAnswer()));
    EXPECT_EQ(failure(), "none");
    const SeenRequest seen = requests().at(0);
    EXPECT_THAT(seen.head, StartsWith("POST /cimom HTTP/1.1\r\n"));
    EXPECT_EQ(seen.field("CIMOperation"), "MethodCall");
    EXPECT_EQ(seen.field("CIMProtocolVersion"), "1.0");
    EXPECT_EQ(seen.field("CIMMethod"), "EnumerateInstanceNames");
    EXPECT_EQ(seen.field("CIMObject"), "root%2Fcimv2");
    EXPECT_EQ(seen.field("Content-Type"), "application/xml; charset=\"utf-8\"");
    EXPECT_EQ(seen.field("Authorization"), "(none)");
    EXPECT_EQ(seen.field("Expect"), "(none)");
    EXPECT_EQ(seen.field("Host"), "127.0.0.1:" + std::to_string(options.server.port));
}

TEST_F(Http, The_object_of_a_method_is_percent_encoded) {
    serve([](const SeenRequest&) {
        std::string body;
        cimxml::Request request;
        request.extrinsic = true;
        cimxml::ResponseWriter(request, "h", "n").methodResult(body, {});
        return xmlAnswer(body);
    });
    cim::ObjectPath path("root/cimv2", "C");
    path.setKey("K", cim::Value::string("\xC3\xA4\r\nX: y"));
    connection().invokeMethod(path, "Do", {});
    EXPECT_EQ(requests().at(0).field("CIMObject"),
              "root%2Fcimv2%3AC.K%3D%22%C3%A4%5Cr%5CnX%3A%20y%22");
    EXPECT_EQ(requests().at(0).field("CIMMethod"), "Do");
}

TEST_F(Http, User_and_password_are_sent_as_basic_authentication) {
    serve(xmlAnswer(emptyAnswer()));
    options.server.user = "me";
    options.server.password = "secret:";
    EXPECT_EQ(failure(), "none");
    EXPECT_EQ(requests().at(0).field("Authorization"), "Basic bWU6c2VjcmV0Og==");
}

TEST_F(Http, Operations_share_a_connection) {
    serve(xmlAnswer(emptyAnswer()));
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(failure(), "none");
    }
    ASSERT_EQ(requests().size(), 3U);
    EXPECT_EQ(requests().back().connection, 1);
}

TEST_F(Http, A_connection_that_the_server_closed_is_opened_again) {
    ScriptedAnswer answer = xmlAnswer(emptyAnswer());
    answer.close = true;
    serve(answer);
    EXPECT_EQ(failure(), "none");
    EXPECT_EQ(failure(), "none");
    EXPECT_EQ(requests().back().connection, 2);
}

TEST_F(Http, A_chunked_answer_is_read) {
    serve([](const SeenRequest&) {
        std::string bytes = "HTTP/1.1 200 OK\r\nContent-Type: text/xml\r\n"
                            "Transfer-Encoding: chunked\r\n\r\n";
        for (const char c : emptyAnswer()) {
            bytes += std::string("1\r\n") + c + "\r\n";
        }
        return ScriptedAnswer{bytes + "0\r\n\r\n", false, 0};
    });
    EXPECT_EQ(failure(), "none");
}

TEST_F(Http, An_error_behind_a_chunked_answer_counts) {
    serve({"HTTP/1.1 200 OK\r\nContent-Type: text/xml\r\nTransfer-Encoding: chunked\r\n"
           "Trailer: CIMStatusCode\r\n\r\n5\r\n<CIM>\r\n0\r\nCIMStatusCode: 1\r\n"
           "CIMStatusCodeDescription: provider%20lost\r\n\r\n",
           false, 0});
    EXPECT_EQ(failure(), "1: provider lost");
}

TEST_F(Http, A_wrong_password_is_access_denied) {
    serve({"HTTP/1.1 401 Unauthorized\r\nWWW-Authenticate: Basic realm=\"x\"\r\n"
           "Content-Length: 2\r\n\r\nno",
           false, 0});
    EXPECT_EQ(failure(), "2: " + address() + " does not accept this user and password");
}

TEST_F(Http, Other_states_are_failures_with_what_the_server_says) {
    serve({"HTTP/1.1 500 Internal Server Error\r\nContent-Length: 0\r\n\r\n", false, 0});
    EXPECT_EQ(failure(),
              "1: " + address() + " answered with HTTP status 500 Internal Server Error");
    serve({"HTTP/1.1 400 Bad Request\r\nCIMError: request-not-valid\r\nContent-Length: 0\r\n\r\n",
           false, 0});
    EXPECT_THAT(failure(), HasSubstr("400 Bad Request, request-not-valid"));
}

TEST_F(Http, Redirects_are_not_followed) {
    serve({"HTTP/1.1 302 Found\r\nLocation: http://127.0.0.1:1/\r\nContent-Length: 0\r\n\r\n",
           false, 0});
    EXPECT_THAT(failure(), HasSubstr("302 Found"));
    EXPECT_EQ(requests().size(), 1U);
}

TEST_F(Http, Proxies_of_the_environment_are_not_asked) {
    serve(xmlAnswer(emptyAnswer()));
    ASSERT_EQ(setenv("http_proxy", "http://127.0.0.1:1/", 1), 0);
    EXPECT_EQ(failure(), "none");
    unsetenv("http_proxy");
}

TEST_F(Http, Another_content_type_is_refused) {
    serve({"HTTP/1.1 200 OK\r\nContent-Type: text/html\r\nContent-Length: 2\r\n\r\n<x", false, 0});
    EXPECT_EQ(failure(), "1: " + address() + " is no CIM server: it answered with text/html");
}

TEST_F(Http, An_answer_that_is_cut_short_is_a_failure) {
    const std::string body = emptyAnswer();
    serve({"HTTP/1.1 200 OK\r\nContent-Type: text/xml\r\nContent-Length: 10000\r\n\r\n" + body,
           true, 0});
    EXPECT_THAT(failure(), HasSubstr("1: the answer of " + address() + " is cut short"));
    serve({"HTTP/1.1 200 OK\r\nContent-Type: text/xml\r\n\r\n" + body.substr(0, 100), true, 0});
    EXPECT_THAT(failure(), HasSubstr("1: the answer is cut short or no XML"));
    serve({"HTTP/1.1 200 OK\r\nContent-Length: 0\r\n\r\n", false, 0});
    EXPECT_THAT(failure(), HasSubstr("1: the answer is cut short or no XML"));
}

TEST_F(Http, Garbage_is_a_failure) {
    serve({"\x01\x02 what?\r\n\r\n", true, 0});
    EXPECT_THAT(failure(), StartsWith("1: "));
    serve({"", true, 0});
    EXPECT_THAT(failure(), StartsWith("1: no answer from " + address()));
    serve(
        {"HTTP/1.1 200 OK\r\nContent-Type: text/xml\r\nContent-Length: 6\r\n\r\nrubbish", true, 0});
    EXPECT_THAT(failure(), HasSubstr("no XML"));
}

TEST_F(Http, A_server_that_says_nothing_is_given_up) {
    options.idleTimeout = std::chrono::seconds(1);
    ScriptedAnswer late = xmlAnswer(emptyAnswer());
    late.delayMilliseconds = 20'000;
    serve(late);
    EXPECT_EQ(failure(), "1: " + address() + " sent nothing for 1 seconds");
}

TEST_F(Http, A_server_that_stops_in_the_middle_is_given_up_on_a_used_connection_too) {
    options.idleTimeout = std::chrono::seconds(1);
    serve([](const SeenRequest& seen) {
        ScriptedAnswer answer = xmlAnswer(emptyAnswer());
        if (seen.body.find("ID=\"2\"") != std::string::npos) {
            answer.bytes.resize(answer.bytes.size() - 50);
        }
        return answer;
    });
    EXPECT_EQ(failure(), "none");
    EXPECT_EQ(failure(), "1: " + address() + " sent nothing for 1 seconds");
    EXPECT_EQ(requests().size(), 2U);
    EXPECT_EQ(requests().back().connection, 1);
}

TEST_F(Http, A_server_that_is_not_there_is_unreachable) {
    options.server.host = "127.0.0.1";
    options.server.port = static_cast<std::uint16_t>(deadPort());
    EXPECT_THAT(failure(), StartsWith("unreachable: cannot reach " + address() + ": "));
}

TEST_F(Http, A_server_without_tls_is_unreachable_with_it) {
    serve(ScriptedAnswer{"HTTP/1.1 400 Bad Request\r\n\r\n", true, 0});
    options.server.tls = true;
    options.connectTimeout = std::chrono::seconds(1);
    EXPECT_THAT(failure(), StartsWith("unreachable: cannot reach https://"));
}

TEST_F(Http, A_certificate_file_that_is_not_there_is_told) {
    serve(ScriptedAnswer{"", true, 0});
    options.server.tls = true;
    options.caCertificate = "/nonexistent/ca.pem";
    EXPECT_THAT(failure(), HasSubstr("/nonexistent/ca.pem"));
}

} // namespace
} // namespace qelo::client
