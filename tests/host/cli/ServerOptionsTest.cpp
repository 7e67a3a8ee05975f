// The options that make the program a client of a server.
#include "Program.h"

#include <client/Unreachable.h>

namespace qelo::cli {
namespace {

class ServerOptions : public Program {};

TEST_F(ServerOptions, They_reach_the_connection_from_either_side_of_the_command) {
    EXPECT_EQ(run({"--url", "https://h", "ein", "C", "--ca-cert", "c.pem", "--password-file", "p"}),
              0)
        << errors.text();
    EXPECT_EQ(options().url, "https://h");
    EXPECT_EQ(options().caCertificate, "c.pem");
    EXPECT_EQ(options().passwordFile, "p");
    EXPECT_FALSE(options().insecure);
    EXPECT_EQ(run({"ein", "C", "--insecure", "--url", "https://h"}), 0) << errors.text();
    EXPECT_TRUE(options().insecure);
}

TEST_F(ServerOptions, They_exclude_the_options_for_providers_in_this_process) {
    const std::vector<std::vector<std::string>> contradictions = {
        {"--store", "accounts:/x"}, {"--root", "/x"}, {"--provider-dir", "/x"}};
    for (auto arguments : contradictions) {
        arguments.insert(arguments.end(), {"ein", "C", "--url", "http://h"});
        EXPECT_EQ(run(arguments), ExitUsage);
    }
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(ServerOptions, They_need_a_server) {
    EXPECT_EQ(run({"ein", "C", "--insecure"}), ExitUsage);
    EXPECT_EQ(run({"ein", "C", "--ca-cert", "x"}), ExitUsage);
    EXPECT_EQ(run({"ein", "C", "--password-file", "x"}), ExitUsage);
    EXPECT_EQ(run({"ein", "C", "--url", ""}), ExitUsage);
    EXPECT_EQ(run({"ein", "C", "--url", "http://h", "--insecure", "--ca-cert", "x"}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(ServerOptions, A_server_that_cannot_be_reached_has_a_status_of_its_own) {
    manager.failWith(client::Unreachable("cannot reach http://h:5988: nobody there"));
    EXPECT_EQ(run({"ein", "C", "--url", "http://h"}), ExitUnavailable);
    EXPECT_EQ(errors.text(), "qelosim: cannot reach http://h:5988: nobody there\n");
}

} // namespace
} // namespace qelo::cli
