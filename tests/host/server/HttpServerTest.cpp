// The server over real connections: who gets in, what is answered, and what it withstands.
#include "FakeRouter.h"
#include "RawClient.h"
#include "RequestText.h"
#include "TestSchema.h"

#include <server/HttpServer.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <fstream>
#include <future>
#include <thread>
#include <vector>

namespace {

using namespace qelo;
using namespace qelo::server;
using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class OnePassword final : public PasswordChecker {
public:
    bool check(const std::string& user, const std::string& password) const override {
        ++checks;
        return (user == "root" || user == "ada") && password == "secret:with colon";
    }
    mutable std::atomic<int> checks{0};
};

class HttpServerTest : public testing::Test {
protected:
    void start() {
        ServerOptions options;
        options.port = 0;
        options.passwords = passwords_;
        options.limits = limits_;
        options.log = [this](const std::string& line) {
            const std::lock_guard<std::mutex> lock(mutex_);
            log_.push_back(line);
        };
        server_ = std::make_unique<HttpServer>(
            std::move(options),
            std::make_shared<const Operations>(Operations::Services{
                router_, testSchema(), [](const std::string& user) { return user == "root"; },
                "host.test"}));
    }
    RawClient connect() const { return RawClient(server_->port()); }
    RawClient::Answer ask(const Post& post) const {
        RawClient client = connect();
        client.send(post.text());
        return client.receive();
    }
    static Post listing() {
        Post post;
        post.body = intrinsicRequest("EnumerateInstanceNames", classNameParameter("TEST_Thing"));
        return post;
    }
    static Post instances() {
        Post post;
        post.method = "EnumerateInstances";
        post.body = intrinsicRequest("EnumerateInstances", classNameParameter("TEST_Thing"));
        return post;
    }
    static Post method() {
        Post post;
        post.method = "Weigh";
        post.object = "root%2Ftest%3ATEST_Thing";
        post.body = extrinsicRequest("Weigh", "1", "");
        return post;
    }
    void expectStillServing() {
        const RawClient::Answer answer = ask(listing());
        EXPECT_EQ(answer.status, 200);
        EXPECT_THAT(answer.body, HasSubstr("INSTANCENAME"));
    }

    std::shared_ptr<FakeRouter> router_ = std::make_shared<FakeRouter>();
    std::shared_ptr<OnePassword> passwords_; // null: nobody is asked
    ServerLimits limits_;
    std::mutex mutex_;
    std::vector<std::string> log_;
    std::unique_ptr<HttpServer> server_;
};

TEST_F(HttpServerTest, A_request_is_answered) {
    start();
    const RawClient::Answer answer = ask(listing());
    EXPECT_EQ(answer.status, 200);
    EXPECT_TRUE(answer.complete);
    EXPECT_EQ(answer.field("CIMOperation"), "MethodResponse");
    EXPECT_THAT(answer.field("Content-Type"), HasSubstr("application/xml"));
    EXPECT_THAT(answer.body, HasSubstr("ID=\"4711\""));
}

TEST_F(HttpServerTest, A_connection_serves_several_requests) {
    start();
    RawClient client = connect();
    for (int i = 0; i < 5; ++i) {
        ASSERT_TRUE(client.send(listing().text()));
        EXPECT_EQ(client.receive().status, 200) << i;
    }
    EXPECT_EQ(router_->asked().size(), 5U);
}

TEST_F(HttpServerTest, Requests_sent_at_once_are_answered_in_order) {
    start();
    RawClient client = connect();
    ASSERT_TRUE(client.send(listing().text() + method().text() + listing().text()));
    EXPECT_THAT(client.receive().body, HasSubstr("INSTANCENAME"));
    EXPECT_THAT(client.receive().body, HasSubstr("CODE=\"2\""));
    EXPECT_THAT(client.receive().body, HasSubstr("INSTANCENAME"));
}

TEST_F(HttpServerTest, A_long_answer_comes_in_chunks_and_complete) {
    router_->count = 20'000;
    start();
    const RawClient::Answer answer = ask(instances());
    EXPECT_EQ(answer.field("Transfer-Encoding"), "chunked");
    EXPECT_TRUE(answer.complete);
    EXPECT_THAT(answer.body, HasSubstr(">19999</KEYVALUE>"));
    EXPECT_EQ(answer.body.substr(answer.body.size() - 7), "</CIM>\n");
}

TEST_F(HttpServerTest, An_error_in_the_middle_of_a_long_answer_does_not_look_like_its_end) {
    router_->count = 20'000;
    router_->beforeResult = [](std::size_t index) {
        if (index == 15'000) {
            throw client::CimError(1, "lost in the middle");
        }
    };
    start();
    const RawClient::Answer answer = ask(instances());
    EXPECT_FALSE(answer.complete);
    router_->beforeResult = nullptr;
    router_->count = 3;
    expectStillServing();
}

TEST_F(HttpServerTest, An_error_early_on_is_a_whole_answer) {
    router_->beforeResult = [](std::size_t index) {
        if (index == 2) {
            throw client::CimError(1, "lost <early>");
        }
    };
    start();
    const RawClient::Answer answer = ask(instances());
    EXPECT_EQ(answer.status, 200);
    EXPECT_TRUE(answer.complete);
    EXPECT_THAT(answer.body, HasSubstr("<ERROR CODE=\"1\" DESCRIPTION=\"lost &lt;early&gt;\""));
}

TEST_F(HttpServerTest, A_provider_that_throws_something_foreign_costs_one_answer_only) {
    router_->beforeResult = [](std::size_t) { throw std::runtime_error("foreign"); };
    start();
    EXPECT_EQ(ask(instances()).status, 500);
    router_->beforeResult = nullptr;
    expectStillServing();
}

// Who gets in.

class HttpLoginTest : public HttpServerTest {
protected:
    void SetUp() override {
        passwords_ = std::make_shared<OnePassword>();
        limits_.failedLogin = 50ms;
        start();
    }
    RawClient::Answer askAs(Post post, const std::string& authorization) const {
        if (!authorization.empty()) {
            post.furtherHeaders = "Authorization: " + authorization + "\r\n";
        }
        return ask(post);
    }
    void expectShutOut(const std::string& authorization) {
        for (const Post& post : {listing(), method()}) {
            const RawClient::Answer answer = askAs(post, authorization);
            EXPECT_EQ(answer.status, 401) << authorization;
            EXPECT_THAT(answer.field("WWW-Authenticate"), HasSubstr("Basic realm="));
            EXPECT_THAT(answer.body, Not(HasSubstr("<")));
        }
        EXPECT_THAT(router_->asked(), IsEmpty());
    }
};

TEST_F(HttpLoginTest, Without_credentials_nothing_happens) { expectShutOut(""); }

TEST_F(HttpLoginTest, With_malformed_credentials_nothing_happens) {
    for (const char* text :
         {"Basic", "Basic ", "Basic !!!!", "Basic =", "Bearer abc", "Digest username=\"root\"",
          "Basic cm9vdA==" /* root, no colon */, "Basic Og==" /* : */}) {
        expectShutOut(text);
    }
}

TEST_F(HttpLoginTest, Unknown_users_and_wrong_passwords_are_shut_out) {
    expectShutOut("Basic " + base64("eve:secret:with colon"));
    expectShutOut("Basic " + base64("root:wrong"));
    expectShutOut("Basic " + base64("root:"));
}

TEST_F(HttpLoginTest, The_right_password_lets_everybody_read_and_root_call_methods) {
    Post read = listing();
    Post call = method();
    read.credentials = call.credentials = "ada:secret:with colon";
    EXPECT_EQ(ask(read).status, 200);
    EXPECT_EQ(router_->lastContext.principal, "ada");
    EXPECT_THAT(ask(call).body, HasSubstr("CODE=\"2\""));
    call.credentials = "root:secret:with colon";
    EXPECT_THAT(ask(call).body, HasSubstr("forty-two"));
    EXPECT_EQ(router_->lastContext.principal, "root");
}

TEST_F(HttpLoginTest, A_password_that_was_right_a_moment_ago_is_not_checked_again) {
    Post post = listing();
    post.credentials = "ada:secret:with colon";
    for (int i = 0; i < 5; ++i) {
        EXPECT_EQ(ask(post).status, 200);
    }
    EXPECT_EQ(passwords_->checks, 1);
    post.credentials = "ada:wrong";
    EXPECT_EQ(ask(post).status, 401);
    EXPECT_EQ(passwords_->checks, 2);
}

TEST_F(HttpLoginTest, A_client_may_try_again_on_the_same_connection) {
    RawClient client = connect();
    Post post = listing();
    client.send(post.text());
    EXPECT_EQ(client.receive().status, 401);
    post.credentials = "ada:wrong";
    client.send(post.text());
    EXPECT_EQ(client.receive().status, 401);
    post.credentials = "ada:secret:with colon";
    client.send(post.text());
    EXPECT_EQ(client.receive().status, 200);
}

TEST_F(HttpLoginTest, Who_is_shut_out_learns_nothing_about_the_request) {
    Post post = listing();
    post.body = "<garbage";
    EXPECT_EQ(ask(post).status, 401);
    RawClient client = connect();
    client.send("GET /etc/passwd HTTP/1.1\r\nHost: x\r\n\r\n");
    EXPECT_EQ(client.receive().status, 401);
}

TEST_F(HttpLoginTest, A_large_body_is_not_waited_for) {
    RawClient client = connect();
    client.send("POST /cimom HTTP/1.1\r\nHost: x\r\nContent-Length: 4000000\r\n\r\n");
    EXPECT_EQ(client.receive().status, 401);
}

TEST_F(HttpLoginTest, Passwords_are_in_no_log) {
    Post post = listing();
    post.credentials = "ada:wrong-but-private";
    EXPECT_EQ(ask(post).status, 401);
    const std::lock_guard<std::mutex> lock(mutex_);
    ASSERT_FALSE(log_.empty());
    for (const std::string& line : log_) {
        EXPECT_THAT(line, HasSubstr("ada"));
        EXPECT_THAT(line, Not(HasSubstr("private")));
    }
}

// What it withstands.

TEST_F(HttpServerTest, A_header_over_the_limit_is_refused) {
    start();
    Post post = listing();
    post.furtherHeaders = "X-Long: " + std::string(20'000, 'x') + "\r\n";
    EXPECT_EQ(ask(post).status, 431);
    post.furtherHeaders = "X-Long: " + std::string(200'000, 'x') + "\r\n";
    RawClient client = connect();
    client.send(post.text());
    const int status = client.receive().status;
    EXPECT_TRUE(status == 431 || status == 0) << status;
    post.furtherHeaders = "X-Long: " + std::string(14'000, 'x') + "\r\n";
    EXPECT_EQ(ask(post).status, 200);
}

TEST_F(HttpServerTest, A_body_over_the_limit_is_refused_before_it_is_sent) {
    start();
    RawClient client = connect();
    Post post;
    std::string text = post.text();
    text.replace(text.find("Content-Length: 0"), 17, "Content-Length: 1073741824");
    client.send(text);
    EXPECT_EQ(client.receive().status, 413);
    expectStillServing();
}

TEST_F(HttpServerTest, A_body_over_the_limit_that_comes_in_chunks_is_refused) {
    limits_.body = 100'000;
    start();
    RawClient client = connect();
    Post post;
    std::string text = post.text();
    text.replace(text.find("Content-Length: 0"), 17, "Transfer-Encoding: chunked");
    client.send(text);
    const std::string chunk = "10000\r\n" + std::string(0x10000, ' ') + "\r\n";
    bool taken = client.send(chunk) && client.send(chunk);
    // It ends just beyond the limit: there is an answer.
    taken = taken && client.send("0\r\n\r\n");
    EXPECT_TRUE(taken);
    EXPECT_EQ(client.receive().status, 413);
    // It does not end: the connection does.
    RawClient endless = connect();
    endless.send(text);
    int sent = 0;
    while (sent < 10'000 && endless.send(chunk)) {
        ++sent;
    }
    EXPECT_LT(sent, 10'000);
    expectStillServing();
}

TEST_F(HttpServerTest, A_body_in_chunks_is_as_good_as_any) {
    start();
    Post post = listing();
    const std::string body = std::exchange(post.body, "");
    std::string text = post.text();
    text.replace(text.find("Content-Length: 0"), 17, "Transfer-Encoding: chunked");
    RawClient client = connect();
    client.send(text);
    for (const char c : body) {
        client.send(std::string("1\r\n") + c + "\r\n");
    }
    client.send("0\r\n\r\n");
    EXPECT_EQ(client.receive().status, 200);
}

TEST_F(HttpServerTest, Bodies_beyond_what_all_may_take_are_refused) {
    limits_.bodies = 300;
    start();
    EXPECT_EQ(ask(listing()).status, 503);
}

TEST_F(HttpServerTest, Xml_that_is_no_request_is_refused_with_a_reason) {
    start();
    Post post = listing();
    post.body = post.body.substr(0, post.body.size() / 2);
    RawClient::Answer answer = ask(post);
    EXPECT_EQ(answer.status, 400);
    EXPECT_EQ(answer.field("CIMError"), "request-not-well-formed");
    post.body = "<?xml version=\"1.0\"?><!DOCTYPE a [<!ENTITY b \"x\"><!ENTITY c \"&b;&b;\">]>"
                "<CIM>&c;</CIM>";
    EXPECT_EQ(ask(post).status, 400);
    std::string deep;
    for (int i = 0; i < 100'000; ++i) {
        deep += "<VALUE>";
    }
    post.body = intrinsicRequest("EnumerateInstanceNames", deep);
    EXPECT_EQ(ask(post).status, 400);
    post.body = "";
    EXPECT_EQ(ask(post).status, 400);
    EXPECT_THAT(router_->asked(), IsEmpty());
    expectStillServing();
}

TEST_F(HttpServerTest, Headers_that_contradict_the_body_are_refused) {
    start();
    Post post = listing();
    post.method = "DeleteInstance";
    const RawClient::Answer answer = ask(post);
    EXPECT_EQ(answer.status, 400);
    EXPECT_EQ(answer.field("CIMError"), "header-mismatch");
    EXPECT_THAT(router_->asked(), IsEmpty());
}

TEST_F(HttpServerTest, A_header_that_says_two_things_is_refused) {
    start();
    for (const char* more : {"CIMObject: root%2Fother\r\n", "cimmethod: DeleteInstance\r\n",
                             "Content-Type: text/xml\r\n", "Transfer-Encoding: chunked\r\n"}) {
        Post post = listing();
        post.furtherHeaders = more;
        const int status = ask(post).status;
        EXPECT_TRUE(status == 400 || status == 0) << more << status;
    }
    EXPECT_THAT(router_->asked(), IsEmpty());
    expectStillServing();
}

TEST_F(HttpServerTest, A_client_that_reset_its_connection_is_not_worked_for) {
    limits_.workers = 1;
    std::promise<void> go;
    auto gate = go.get_future().share();
    std::atomic<int> asked{0};
    router_->beforeResult = [&](std::size_t index) {
        asked += index == 0 ? 1 : 0;
        gate.wait();
    };
    start();
    RawClient first = connect();
    first.send(instances().text());
    while (asked == 0) {
        std::this_thread::sleep_for(1ms);
    }
    {
        RawClient gone = connect();
        gone.send(instances().text());
        std::this_thread::sleep_for(100ms); // until it waits for the worker
        gone.resetWhenClosed();
    }
    RawClient last = connect();
    last.send(listing().text());
    go.set_value();
    EXPECT_EQ(first.receive().status, 200);
    EXPECT_EQ(last.receive().status, 200);
    EXPECT_EQ(asked, 2);
}

TEST_F(HttpServerTest, Garbage_instead_of_http_is_survived) {
    limits_.idle = 1s;
    start();
    for (const std::string& text :
         {std::string("\r\n\r\n\r\n"), std::string("garbage\r\n\r\n"), std::string(100, '\0'),
          std::string("POST /cimom HTTP/9.9\r\n\r\n"), std::string("\x16\x03\x01\x02", 4),
          std::string("POST /cimom HTTP/1.1\r\nContent-Length: -5\r\n\r\n"),
          std::string("POST /cimom HTTP/1.1\r\nTransfer-Encoding: chunked\r\n\r\nzz\r\n")}) {
        RawClient client = connect();
        client.send(text);
        client.finishSending();
        EXPECT_NE(client.receive(5s).status, 200);
    }
    expectStillServing();
}

TEST_F(HttpServerTest, A_connection_without_a_byte_is_closed) {
    limits_.idle = 1s;
    start();
    RawClient client = connect();
    EXPECT_TRUE(client.isClosedWithin(10s));
}

TEST_F(HttpServerTest, A_request_that_comes_byte_by_byte_is_given_up) {
    limits_.idle = 2s;
    limits_.request = 2s;
    start();
    RawClient client = connect();
    const auto begin = std::chrono::steady_clock::now();
    const std::string text = listing().text();
    for (const char c : text) {
        if (!client.send(std::string(1, c))) {
            break;
        }
        std::this_thread::sleep_for(20ms);
    }
    EXPECT_LT(std::chrono::steady_clock::now() - begin, 15s);
    EXPECT_EQ(client.receive(1s).status, 0);
}

TEST_F(HttpServerTest, Clients_that_do_not_read_block_nobody) {
    router_->count = 20'000;
    limits_.workers = 2;
    start();
    std::vector<RawClient> idle;
    for (int i = 0; i < 20; ++i) {
        idle.push_back(connect());
        ASSERT_TRUE(idle.back().send(instances().text()));
    }
    const auto begin = std::chrono::steady_clock::now();
    Post one;
    one.method = "GetInstance";
    one.body = intrinsicRequest("GetInstance", instanceNameParameter("InstanceName", "1"));
    EXPECT_EQ(ask(one).status, 200);
    EXPECT_LT(std::chrono::steady_clock::now() - begin, 30s);
    // They still get theirs.
    const RawClient::Answer late = idle.front().receive();
    EXPECT_TRUE(late.complete);
}

TEST_F(HttpServerTest, A_client_that_goes_away_costs_its_answer_only) {
    router_->count = 20'000;
    start();
    for (int i = 0; i < 20; ++i) {
        RawClient client = connect();
        client.send(instances().text());
    }
    router_->count = 3;
    expectStillServing();
}

TEST_F(HttpServerTest, A_slow_provider_keeps_only_its_own_client_waiting) {
    std::promise<void> go;
    auto gate = go.get_future().share();
    std::atomic<int> waiting{0};
    router_->beforeResult = [&](std::size_t) {
        ++waiting;
        gate.wait();
    };
    start();
    RawClient slow = connect();
    slow.send(instances().text());
    while (waiting == 0) {
        std::this_thread::sleep_for(1ms);
    }
    Post names = listing();
    names.method = "EnumerateClassNames";
    names.body = intrinsicRequest("EnumerateClassNames", "");
    EXPECT_EQ(ask(names).status, 200);
    go.set_value();
    EXPECT_EQ(slow.receive().status, 200);
}

TEST_F(HttpServerTest, A_thousand_connections_at_once_are_all_served) {
    start();
    std::vector<RawClient> clients;
    for (int i = 0; i < 1000; ++i) {
        clients.push_back(connect());
        if (!clients.back().isConnected()) {
            GTEST_SKIP() << "this process may not open 1000 connections";
        }
    }
    for (RawClient& client : clients) {
        ASSERT_TRUE(client.send(listing().text()));
    }
    int served = 0;
    for (RawClient& client : clients) {
        served += client.receive().status == 200 ? 1 : 0;
    }
    EXPECT_EQ(served, 1000);
}

TEST_F(HttpServerTest, Connections_beyond_the_limit_wait_for_a_place) {
    limits_.connections = 4;
    limits_.idle = 1s;
    start();
    std::vector<RawClient> holders;
    for (int i = 0; i < 4; ++i) {
        holders.push_back(connect());
    }
    expectStillServing(); // once the idle ones have been closed
}

TEST_F(HttpServerTest, The_end_of_the_server_waits_for_what_runs) {
    std::promise<void> started;
    router_->count = 1;
    router_->beforeResult = [&](std::size_t) {
        started.set_value();
        std::this_thread::sleep_for(200ms);
    };
    start();
    RawClient client = connect();
    client.send(instances().text());
    started.get_future().wait();
    server_.reset();
    EXPECT_EQ(client.receive().status, 200);
}

TEST_F(HttpServerTest, The_end_of_the_server_ends_answers_that_nobody_reads) {
    router_->count = 200'000;
    start();
    RawClient client = connect();
    client.send(instances().text());
    std::this_thread::sleep_for(100ms);
    const auto begin = std::chrono::steady_clock::now();
    server_.reset();
    EXPECT_LT(std::chrono::steady_clock::now() - begin, 25s);
}

TEST(HttpServer, Addresses) {
    EXPECT_TRUE(isLoopback("127.0.0.1"));
    EXPECT_TRUE(isLoopback("127.1.2.3"));
    EXPECT_TRUE(isLoopback("::1"));
    EXPECT_FALSE(isLoopback("0.0.0.0"));
    EXPECT_FALSE(isLoopback("::"));
    EXPECT_FALSE(isLoopback("192.168.1.1"));
    EXPECT_THROW(isLoopback("localhost"), std::runtime_error);
    EXPECT_THROW(isLoopback(""), std::runtime_error);
}

TEST_F(HttpServerTest, A_port_that_is_taken_is_an_error) {
    start();
    ServerOptions options;
    options.port = server_->port();
    EXPECT_THROW(HttpServer(options, nullptr), std::runtime_error);
}

} // namespace
