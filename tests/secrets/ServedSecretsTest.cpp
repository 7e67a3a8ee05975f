// Passwords that pass through a server, of those who log in as well as those that methods set.
#include "ProcessMemory.h"
#include "SecretsFixture.h"

#include "host/server/RawClient.h"

#include <gmock/gmock.h>

#include <iostream>

#include <sys/stat.h>
#include <unistd.h>

namespace qelo::secrets {
namespace {

using server::Post;
using server::RawClient;
using testing::HasSubstr;

class ServedSecrets : public Secrets {
protected:
    void start(const std::vector<std::string>& more = {}) { serve(login_, more); }

    void expectForgotten(const Password& password) {
        if (geteuid() != 0) {
            std::cout << "[   NOTE   ] the memory of the server is not searched: only the "
                         "superuser can read it\n";
            return;
        }
        if (!memoryTells()) {
            std::cout << "[   NOTE   ] the memory of the server is not searched: a sanitizer keeps "
                         "what is freed\n";
            return;
        }
        EXPECT_EQ(placesThatStay(server().process(), password), "");
    }
    void expectNothingLeft() {
        const std::vector<const Password*> all = {&login_, &wrong_, &plain_, &awkward_};
        const std::string shown =
            processFile(server().process(), "environ") + processFile(server().process(), "cmdline");
        for (const Password* password : all) {
            expectForgotten(*password);
            EXPECT_EQ(password->formsIn(shown), "");
        }
        for (const Password* password : all) {
            expectUnseen(*password);
        }
    }

    std::string credentials(const Password& password) const { return "root:" + password.text(); }

    Post setPassword(const std::string& password, const std::string& name = "alice") const {
        Post post;
        post.method = "SetPassword";
        post.object = "root/cimv2:ZANTH_Account";
        post.body = methodCall("SetPassword", {{"Name", name}, {"UserPassword", password}});
        post.credentials = credentials(login_);
        return post;
    }
    // Sends it and keeps the reply.
    RawClient::Answer ask(const RawClient& client, const std::string& text) {
        EXPECT_TRUE(client.send(text));
        RawClient::Answer answer = const_cast<RawClient&>(client).receive();
        keep(answer.header + answer.body);
        return answer;
    }
    RawClient::Answer ask(const Post& post) { return ask(RawClient(server().port()), post.text()); }

    const Password login_ = Password::plain();
    const Password wrong_ = Password::plain();
    const Password plain_ = Password::plain();
    const Password awkward_ = Password::awkward();
};

TEST_F(ServedSecrets, Qelosim_as_a_client_leaves_nothing) {
    start();
    for (const Password* password : {&plain_, &awkward_}) {
        const std::vector<std::string> call = {"cm", "ZANTH_Account", "SetPassword", "Name=alice",
                                               "UserPassword=" + password->text()};
        EXPECT_EQ(remote(call, server().urlFor(credentials(login_))).status, 0);
        expectPasswordOf("alice", *password);
        EXPECT_NE(remote(call, server().urlFor(credentials(wrong_))).status, 0);
    }
    const std::string file = give("login", login_.text() + "\n");
    const std::string url = server().urlFor("root");
    EXPECT_EQ(remote({"accounts", "--password-file", file}, url).status, 0);
    const std::string wrong = give("wrong", wrong_.text() + "\n");
    EXPECT_NE(remote({"accounts", "--password-file", wrong}, url).status, 0);
    EXPECT_EQ(runOnTerminal({login_.text(), plain_.text(), plain_.text()},
                            {"set-password", "alice", "--url", url})
                  .status,
              0);
    expectPasswordOf("alice", plain_);
    EXPECT_THAT(starts(), HasSubstr("starts /usr/sbin/"));
    expectNothingLeft();
}

TEST_F(ServedSecrets, Wbemcli_as_a_client_leaves_nothing) {
    if (endtoend::runProcess({"wbemcli"}).status == 127) {
        GTEST_SKIP() << "wbemcli is not installed";
    }
    start();
    const std::string object = "root/cimv2:ZANTH_Account";
    const std::string call = "SetPassword.Name=\"alice\",UserPassword=\"" + plain_.text() + "\"";
    EXPECT_THAT(wbemcli({"cm", server().object(object, credentials(login_)), call}).out,
                HasSubstr("SetPassword: 0"));
    expectPasswordOf("alice", plain_);
    EXPECT_NE(wbemcli({"cm", server().object(object, credentials(wrong_)), call}).status, 0);
    EXPECT_THAT(wbemcli({"ei", server().object(object, credentials(login_))}).out,
                HasSubstr("UserPassword"));
    expectNothingLeft();
}

TEST_F(ServedSecrets, Replies_and_kept_connections_hold_nothing) {
    start();
    const RawClient client(server().port());
    for (const Password* password : {&plain_, &awkward_}) {
        const auto answer = ask(client, setPassword(password->inXml()).text());
        EXPECT_EQ(answer.status, 200) << answer.header;
        EXPECT_THAT(answer.body, HasSubstr("<RETURNVALUE"));
        expectPasswordOf("alice", *password);
    }
    Post post = setPassword(plain_.text());
    post.credentials = credentials(wrong_);
    EXPECT_EQ(ask(client, post.text()).status, 401);
    EXPECT_TRUE(client.isConnected());
    expectNothingLeft();
}

TEST_F(ServedSecrets, Short_passwords_do_not_stay_either) {
    // Texts this short have their place inside strings, not in memory that is freed.
    const Password brief("q7Xw2Kp9");
    start();
    EXPECT_EQ(ask(setPassword(brief.text())).status, 200);
    expectPasswordOf("alice", brief);
    Post post = setPassword(brief.text());
    post.credentials = credentials(brief);
    EXPECT_EQ(ask(post).status, 401);
    expectForgotten(brief);
    expectUnseen(brief);
}

TEST_F(ServedSecrets, Tls_leaves_nothing) {
    const auto [certificate, key] = endtoend::selfSignedCertificate();
    const std::string certificateFile = give("cert.pem", certificate);
    const std::string keyFile = give("key.pem", key);
    chmod(keyFile.c_str(), 0600);
    start({"--tls-cert", certificateFile, "--tls-key", keyFile});
    for (const Password* password : {&plain_, &awkward_}) {
        const auto finished =
            remote({"cm", "ZANTH_Account", "SetPassword", "Name=alice",
                    "UserPassword=" + password->text(), "--ca-cert", certificateFile},
                   server().urlFor(credentials(login_)));
        EXPECT_EQ(finished.status, 0) << finished.err;
        expectPasswordOf("alice", *password);
    }
    expectNothingLeft();
}

TEST_F(ServedSecrets, Refused_calls_leave_nothing) {
    start();
    for (const Password* password : {&plain_, &awkward_}) {
        const std::string text = password->inXml();
        EXPECT_THAT(ask(setPassword(text, "nobody-here")).body, HasSubstr("<ERROR"));
        ask(setPassword(text + "," + text));
        ask(setPassword(text + std::string(2000, 'x')));
        Post post = setPassword(text);
        post.credentials = credentials(wrong_);
        EXPECT_EQ(ask(post).status, 401);
        post = setPassword(text);
        post.method = "EnumerateInstances";
        EXPECT_EQ(ask(post).status, 400) << "header and body do not fit";
        post = setPassword(text);
        post.body += "<" + text;
        EXPECT_EQ(ask(post).status, 400) << "not well-formed";
        post = setPassword(text);
        post.body.insert(post.body.find("<VALUE>"), "<" + plain_.text() + "/>");
        EXPECT_EQ(ask(post).status, 400) << "not valid";
        post = setPassword(text);
        post.body = methodCall("SetPassword",
                               {{"Name", "alice"}, {"UserPassword", text}, {"Further", text}});
        EXPECT_EQ(ask(post).status, 200);
    }
    expectNothingLeft();
}

TEST_F(ServedSecrets, A_store_that_fails_leaves_nothing) {
    start();
    std::filesystem::remove(root() + "/etc/shadow");
    std::filesystem::create_directory(root() + "/etc/shadow");
    for (const Password* password : {&plain_, &awkward_}) {
        EXPECT_THAT(ask(setPassword(password->inXml())).body, HasSubstr("<ERROR"));
    }
    expectNothingLeft();
}

TEST_F(ServedSecrets, Instances_with_a_password_leave_nothing) {
    start();
    for (const Password* password : {&plain_, &awkward_}) {
        Post post = setPassword("");
        post.method = "CreateInstance";
        post.object = "root/cimv2";
        post.body =
            R"(<?xml version="1.0"?><CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" )"
            R"(PROTOCOLVERSION="1.0"><SIMPLEREQ><IMETHODCALL NAME="CreateInstance">)"
            R"(<LOCALNAMESPACEPATH><NAMESPACE NAME="root"/><NAMESPACE NAME="cimv2"/>)"
            R"(</LOCALNAMESPACEPATH><IPARAMVALUE NAME="NewInstance"><INSTANCE )"
            R"(CLASSNAME="ZANTH_Account"><PROPERTY NAME="Name" TYPE="string"><VALUE>bob</VALUE>)"
            R"(</PROPERTY><PROPERTY.ARRAY NAME="UserPassword" TYPE="string"><VALUE.ARRAY><VALUE>)" +
            password->inXml() +
            "</VALUE></VALUE.ARRAY></PROPERTY.ARRAY></INSTANCE></IPARAMVALUE></IMETHODCALL>"
            "</SIMPLEREQ></MESSAGE></CIM>";
        EXPECT_THAT(ask(post).body, HasSubstr("<ERROR"));
    }
    expectNothingLeft();
}

TEST_F(ServedSecrets, Requests_that_break_off_leave_nothing) {
    start();
    for (const Password* password : {&plain_, &awkward_}) {
        const std::string text = setPassword(password->inXml()).text();
        for (const std::size_t part : {text.find("Basic") + 20, text.find("CIMOp") + 5,
                                       text.find("</VALUE></PARAMVALUE></METHODCALL>") + 10}) {
            const RawClient client(server().port());
            EXPECT_TRUE(client.send(text.substr(0, part)));
            usleep(50'000);
        }
    }
    expectNothingLeft();
}

TEST_F(ServedSecrets, Large_requests_leave_nothing) {
    start();
    Post post = setPassword(plain_.text() + std::string(100'000, ' ') + awkward_.inXml());
    EXPECT_EQ(ask(post).status, 200);
    post.body += std::string(5'000'000, ' ');
    const RawClient client(server().port());
    client.send(post.text()); // not to its end: it is refused before
    expectNothingLeft();
}

TEST_F(ServedSecrets, The_search_finds_a_password_while_it_is_in_use) {
    if (geteuid() != 0) {
        GTEST_SKIP() << "only the superuser can read the memory of the server";
    }
    if (!memoryTells()) {
        GTEST_SKIP() << "not with a sanitizer: its tables take too long to read";
    }
    start();
    const std::string text = setPassword(plain_.text()).text();
    const RawClient client(server().port());
    ASSERT_TRUE(client.send(text.substr(0, text.find("</METHODCALL>"))));
    std::string places;
    for (int i = 0; i < 100 && places.empty(); ++i) {
        usleep(50'000);
        places = placesInMemory(server().process(), plain_);
    }
    EXPECT_NE(places, "") << "a request that has not come to its end must be somewhere";
}

} // namespace
} // namespace qelo::secrets
