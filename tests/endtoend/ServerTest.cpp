// `qelosim serve` and `qelosim --url` against each other, and what the command line of the
// server refuses.
#include "Server.h"
#include "Qelosim.h"

#include <gmock/gmock.h>

#include <fstream>
#include <iterator>
#include <sys/stat.h>

namespace qelo::endtoend {
namespace {

using testing::HasSubstr;
using testing::Not;

class ServedDatabase : public AccountDatabase {
protected:
    void serve(std::vector<std::string> arguments) {
        arguments.insert(arguments.end(), {"--store", store()});
        server_ = std::make_unique<Server>(std::move(arguments));
        ASSERT_NE(server_->url(), "") << server_->errors();
    }
    void serveUsers() {
        users_ = scratch.write("users", userLine("root", "rootpass") + userLine("ada", "adapass"));
        serve({"--user-file", users_});
    }
    Finished remote(std::vector<std::string> arguments, const std::string& credentials = {}) const {
        arguments.insert(arguments.end(), {"--url", server_->urlFor(credentials)});
        return qelosim(std::move(arguments));
    }
    Finished refused(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin(), "serve");
        arguments.insert(arguments.end(), {"--store", store()});
        return qelosim(std::move(arguments));
    }

    std::string users_;
    std::unique_ptr<Server> server_;
};

TEST_F(ServedDatabase, Every_command_says_the_same_remotely_as_in_process) {
    serve({"--no-auth"});
    const std::string system = pathOf(
        "ZANTH_ComputerSystem", json({"ei", "ZANTH_ComputerSystem"})[0]["properties"]["Name"]);
    const std::vector<std::vector<std::string>> commands = {
        {"accounts"},
        {"identity"},
        {"service"},
        {"capabilities"},
        {"tree"},
        {"ein", "ZANTH_Account"},
        {"ei", "ZANTH_Account"},
        {"ei", "ZANTH_Group", "-p", "Name,GroupMembers"},
        {"ei", "CIM_ManagedElement"},
        {"ei", "ZANTH_Account", "--json"},
        {"ei", "ZANTH_SimElementCapabilities", "--format", "mof"},
        {"gi", pathOf("ZANTH_Group", "adm")},
        {"gi", "ZANTH_Group.Name=\"adm\""},
        {"gi", "ZANTH_Group.Name=\"none\""},
        {"gi", "ZANTH_Nothing.Name=\"none\""},
        {"ain", system},
        {"ai", system},
        {"rin", system},
        {"ri", system, "--json"},
        {"gc", "ZANTH_Account"},
        {"gc", "CIM_HostedService", "--json"},
        {"gc", "ZANTH_Nothing"},
        {"ecn"},
        {"ecn", "CIM_ManagedElement", "--deep"},
        {"cm", "ZANTH_Account", "DeleteUser", "Name=root"},
        {"cm", "ZANTH_Group", "Nonsense"},
    };
    for (const auto& command : commands) {
        const Finished here = run(command);
        const Finished there = remote(command);
        const std::string shown = testing::PrintToString(command);
        EXPECT_EQ(there.out, here.out) << shown;
        EXPECT_EQ(there.status, here.status) << shown << there.err;
    }
}

TEST_F(ServedDatabase, Changes_work_remotely) {
    serve({"--no-auth"});
    EXPECT_EQ(remote({"modify-user", "alice", "--full-name", "Ä <&> \"quoted\""}).status, 0);
    EXPECT_THAT(run({"gi", "ZANTH_Account.Name=\"alice\"", "-p", "Description"}).out,
                HasSubstr("Ä <&> \\\"quoted\\\""));
}

struct Credentials {
    const char* text; // as in a URL
    bool mayRead;
    bool mayCall;
};
void PrintTo(const Credentials& credentials, std::ostream* stream) {
    *stream << '"' << credentials.text << '"';
}

class LoginMatrix : public ServedDatabase, public testing::WithParamInterface<Credentials> {};

TEST_P(LoginMatrix, Decides_who_may_read_and_who_may_call_methods) {
    serveUsers();
    const Credentials& credentials = GetParam();
    const Finished read = remote({"groups"}, credentials.text);
    EXPECT_EQ(read.status, credentials.mayRead ? 0 : 2) << read.err;
    EXPECT_EQ(read.out.find("adm") != std::string::npos, credentials.mayRead);
    const Finished call = remote(
        {"cm", "ZANTH_Account", "ModifyUser", "Name=alice", "FullName=Changed"}, credentials.text);
    EXPECT_EQ(call.status, credentials.mayCall ? 0 : 2) << call.err;
    EXPECT_EQ(run({"accounts"}).out.find("Changed") != std::string::npos, credentials.mayCall);
}

INSTANTIATE_TEST_SUITE_P(Server, LoginMatrix,
                         testing::Values(Credentials{"eve:adapass", false, false},
                                         Credentials{"ada:rootpass", false, false},
                                         Credentials{"ada:", false, false},
                                         Credentials{"ada:adapass", true, false},
                                         Credentials{"root:rootpass", true, true}));

TEST_F(ServedDatabase, Without_credentials_a_request_is_refused) {
    serveUsers();
    const Finished finished =
        runProcess({"wbemcli", "ein", server_->object("root/cimv2:ZANTH_Group")});
    EXPECT_EQ(finished.out, "");
    EXPECT_NE(finished.status, 0);
}

TEST_F(ServedDatabase, Passwords_are_in_no_output_of_the_server) {
    serveUsers();
    EXPECT_EQ(remote({"groups"}, "ada:very-private").status, 2);
    EXPECT_EQ(remote({"groups"}, "ada:adapass").status, 0);
    EXPECT_EQ(server_->stop(), 0);
    EXPECT_THAT(server_->errors(), HasSubstr("login of \"ada\" failed"));
    EXPECT_THAT(server_->errors(), Not(HasSubstr("private")));
    EXPECT_THAT(server_->errors(), Not(HasSubstr("adapass")));
}

TEST_F(ServedDatabase, Tls_protects_the_connection) {
    const auto [certificate, key] = selfSignedCertificate();
    const std::string certificateFile = scratch.write("cert.pem", certificate);
    const std::string keyFile = scratch.write("key.pem", key);
    chmod(keyFile.c_str(), 0600);
    serve({"--no-auth", "--tls-cert", certificateFile, "--tls-key", keyFile});
    EXPECT_EQ(server_->url().compare(0, 8, "https://"), 0);
    EXPECT_THAT(remote({"groups", "--ca-cert", certificateFile}).out, HasSubstr("adm"));
    EXPECT_THAT(remote({"groups", "--insecure"}).out, HasSubstr("adm"));
    const Finished unknown = remote({"groups"});
    EXPECT_NE(unknown.status, 0);
    EXPECT_EQ(unknown.out, "");
    const Finished stock =
        runProcess({"wbemcli", "ein", "-noverify", server_->object("root/cimv2:ZANTH_Group")});
    EXPECT_THAT(stock.out, HasSubstr("adm"));
}

std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

// It starts itself a second time, for memory's sake.
TEST_F(ServedDatabase, Is_the_process_that_was_started_with_its_arguments) {
    users_ = scratch.write("two words", userLine("root", "rootpass"));
    serve({"--user-file", users_});
    const std::string process = "/proc/" + std::to_string(server_->process());
    EXPECT_EQ(contentOf(process + "/comm"), "qelosim\n");
    const std::string between(1, '\0');
    EXPECT_THAT(contentOf(process + "/cmdline"),
                HasSubstr(between + "--user-file" + between + users_ + between));
    EXPECT_EQ(remote({"groups"}, "root:rootpass").status, 0);
    if (const std::string environment = contentOf(process + "/environ"); !environment.empty()) {
        EXPECT_THAT(environment, HasSubstr("glibc.malloc.tcache_max="));
    }
}

TEST_F(ServedDatabase, Ends_when_it_is_told_to) {
    serve({"--no-auth"});
    EXPECT_EQ(remote({"groups"}).status, 0);
    EXPECT_EQ(server_->stop(), 0);
}

TEST_F(ServedDatabase, A_server_that_cannot_be_reached_is_named) {
    serve({"--no-auth"});
    const std::string url = server_->url();
    server_->stop();
    const Finished finished = qelosim({"groups", "--url", url});
    EXPECT_EQ(finished.status, 69);
    EXPECT_THAT(finished.err, HasSubstr("127.0.0.1"));
}

TEST_F(ServedDatabase, Without_authentication_only_loopback_is_served) {
    const Finished finished = refused({"--no-auth", "--listen", "0.0.0.0:0"});
    EXPECT_EQ(finished.status, 64);
    EXPECT_THAT(finished.err, HasSubstr("loopback"));
}

TEST_F(ServedDatabase, Addresses_and_files_that_cannot_be_used_are_named) {
    EXPECT_THAT(refused({"--listen", "nowhere"}).err, HasSubstr("nowhere"));
    EXPECT_THAT(refused({"--listen", "127.0.0.1:99999"}).err, HasSubstr("ADDRESS:PORT"));
    EXPECT_THAT(refused({"--listen", "192.0.2.1:0"}).err, HasSubstr("192.0.2.1"));
    EXPECT_EQ(refused({"--tls-cert", "x"}).status, 64);
    EXPECT_THAT(refused({"--tls-cert", "/no/cert", "--tls-key", "/no/key"}).err,
                HasSubstr("/no/cert"));
    EXPECT_THAT(refused({"--user-file", "/no/users"}).err, HasSubstr("/no/users"));
    const std::string open = scratch.write("open.pem", "x");
    chmod(open.c_str(), 0644);
    EXPECT_THAT(refused({"--tls-cert", open, "--tls-key", open}).err, HasSubstr("everybody"));
}

TEST_F(ServedDatabase, A_port_that_is_taken_is_named) {
    serve({"--no-auth"});
    const std::string address = server_->url().substr(7);
    const Finished finished = refused({"--no-auth", "--listen", address});
    EXPECT_NE(finished.status, 0);
    EXPECT_THAT(finished.err, HasSubstr("cannot listen"));
}

} // namespace
} // namespace qelo::endtoend
