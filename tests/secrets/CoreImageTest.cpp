// Programs that die, or are looked at, while they have a password.
#include "ProcessMemory.h"
#include "SecretsFixture.h"

#include "host/server/RawClient.h"

#include <gmock/gmock.h>

#include <csignal>
#include <fcntl.h>
#include <netinet/in.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

namespace qelo::secrets {
namespace {

using testing::HasSubstr;

// A port that takes a connection and says nothing.
class SilentServer {
public:
    SilentServer() : socket_(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)) {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        socklen_t size = sizeof address;
        if (bind(socket_, reinterpret_cast<sockaddr*>(&address), size) != 0 ||
            listen(socket_, 8) != 0 ||
            getsockname(socket_, reinterpret_cast<sockaddr*>(&address), &size) != 0) {
            throw std::runtime_error("no port");
        }
        port_ = ntohs(address.sin_port);
    }
    ~SilentServer() { close(socket_); }
    SilentServer(const SilentServer&) = delete;
    SilentServer& operator=(const SilentServer&) = delete;

    std::string url(const std::string& credentials) const {
        return "http://" + credentials + "@127.0.0.1:" + std::to_string(port_);
    }
    // The beginning of the first request.
    std::string request() const {
        const int client = accept4(socket_, nullptr, nullptr, SOCK_CLOEXEC);
        std::string bytes(65536, '\0');
        const ssize_t got = read(client, bytes.data(), bytes.size());
        bytes.resize(got > 0 ? static_cast<std::size_t>(got) : 0);
        held_ = client;
        return bytes;
    }

private:
    int socket_;
    mutable int held_ = -1;
    std::uint16_t port_ = 0;
};

class CoreImages : public Secrets {
protected:
    void SetUp() override {
        Secrets::SetUp();
        getrlimit(RLIMIT_CORE, &before_);
        rlimit all = before_;
        all.rlim_cur = all.rlim_max;
        setrlimit(RLIMIT_CORE, &all);
        here_ = std::filesystem::current_path();
        std::filesystem::create_directory(scratch.path("here"));
        std::filesystem::current_path(scratch.path("here")); // where core files go to
    }
    void TearDown() override {
        std::filesystem::current_path(here_);
        setrlimit(RLIMIT_CORE, &before_);
    }

    // Ends it as a crash does; whether a core image was made.
    static bool leavesCoreImage(pid_t process) {
        kill(process, SIGSEGV);
        int status = 0;
        waitpid(process, &status, 0);
        EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGSEGV) << status;
        return WCOREDUMP(status);
    }

    static pid_t started(const std::vector<std::string>& command) {
        std::vector<char*> arguments;
        for (const std::string& argument : command) {
            arguments.push_back(const_cast<char*>(argument.c_str()));
        }
        arguments.push_back(nullptr);
        const pid_t child = fork();
        if (child == 0) {
            prctl(PR_SET_PDEATHSIG, SIGKILL);
            execvp(arguments[0], arguments.data());
            _exit(127);
        }
        return child;
    }

    // A program of the system that is killed in the same way. Where even that leaves no core
    // image, the tests here say little.
    static void sayWhetherCoreImagesAreMade() {
        const pid_t other = started({"sleep", "60"});
        usleep(300'000);
        std::cout << "[  SECRETS ] core images are " << (leavesCoreImage(other) ? "" : "not ")
                  << "made here\n";
    }

    const Password login_ = Password::plain();
    const Password password_ = Password::plain();

private:
    rlimit before_ = {};
    std::filesystem::path here_;
};

void expectNoCoreAllowed(pid_t process) {
    const std::string limits = processFile(process, "limits");
    const std::size_t line = limits.find("Max core file size");
    ASSERT_NE(line, std::string::npos);
    EXPECT_THAT(limits.substr(line, limits.find('\n', line) - line),
                testing::MatchesRegex("Max core file size +0 +0 +bytes *"));
}

TEST_F(CoreImages, A_server_that_crashes_in_the_middle_of_a_request_leaves_none) {
    sayWhetherCoreImagesAreMade();
    endtoend::Server* const server =
        new endtoend::Server({"--root", root(), "--user-file",
                              give("users", endtoend::userLine("root", login_.text()))});
    ASSERT_NE(server->url(), "") << server->errors();
    server::Post post;
    post.method = "SetPassword";
    post.object = "root/cimv2:ZANTH_Account";
    post.credentials = "root:" + login_.text();
    post.body = methodCall("SetPassword", {{"Name", "alice"}, {"UserPassword", password_.text()}});
    const std::string text = post.text();
    const server::RawClient client(server->port());
    ASSERT_TRUE(client.send(text.substr(0, text.size() - 20)));
    usleep(300'000);
    const pid_t process = server->process();
    expectNoCoreAllowed(process);
    EXPECT_FALSE(leavesCoreImage(process));
    (void)server; // it is dead, and waiting for it would be for another process
    expectUnseen(login_);
    expectUnseen(password_);
}

TEST_F(CoreImages, A_client_that_crashes_while_it_waits_leaves_none) {
    const SilentServer server;
    const pid_t client = started(endtoend::qelosimCommand(
        {"cm", "ZANTH_Account", "SetPassword", "Name=alice", "UserPassword=" + password_.text(),
         "--url", server.url("root:" + login_.text())}));
    EXPECT_THAT(server.request(), HasSubstr("POST"));
    expectNoCoreAllowed(client);
    const std::string arguments = processFile(client, "cmdline");
    EXPECT_THAT(arguments, HasSubstr("UserPassword=xxxx"));
    EXPECT_THAT(arguments, HasSubstr("root:xxxx"));
    for (const Password* password : {&login_, &password_}) {
        EXPECT_EQ(password->formsIn(arguments), "") << arguments;
        EXPECT_EQ(password->formsIn(processFile(client, "environ")), "");
    }
    EXPECT_FALSE(leavesCoreImage(client));
    expectUnseen(login_);
    expectUnseen(password_);
}

TEST_F(CoreImages, Nobody_but_the_superuser_looks_into_a_server) {
    serve(login_);
    struct stat status = {};
    const std::string memory = "/proc/" + std::to_string(server().process()) + "/mem";
    ASSERT_EQ(stat(memory.c_str(), &status), 0);
    EXPECT_EQ(status.st_uid, 0U);
    if (geteuid() != 0) {
        EXPECT_LT(open(memory.c_str(), O_RDONLY | O_CLOEXEC), 0);
    }
}

} // namespace
} // namespace qelo::secrets
