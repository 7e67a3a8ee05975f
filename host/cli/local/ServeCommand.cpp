#include "ServeCommand.h"

#include "../render/Display.h"
#include "ListenAddress.h"
#include "LocalProviders.h"
#include "ThreadCaches.h"

#include <server/HttpServer.h>
#include <server/Permissions.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <malloc.h>
#include <memory>
#include <stdexcept>
#include <string>
#include <sys/eventfd.h>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>

namespace qelo::cli {
namespace {

constexpr std::uint16_t kPlainPort = 5988; // as registered for CIM-XML
constexpr std::uint16_t kTlsPort = 5989;
constexpr char kPamService[] = "qelosim";

struct ServeOptions {
    std::string listen;
    std::string certificateFile;
    std::string keyFile;
    std::string userFile;
    std::string methodGroup;
    bool noAuthentication = false;

    bool tls() const { return !certificateFile.empty(); }
};

std::string readWhole(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    std::string text((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
    if (!file || text.empty()) {
        throw UsageError("cannot read " + path);
    }
    return text;
}

std::string readKey(const std::string& path) {
    struct stat status = {};
    if (stat(path.c_str(), &status) == 0 && (status.st_mode & S_IRWXO) != 0) {
        throw UsageError("everybody may read the key " + path + "; take that permission away");
    }
    return readWhole(path);
}

std::string hostName() {
    char name[256] = {};
    return gethostname(name, sizeof name - 1) == 0 && name[0] != '\0' ? name : "localhost";
}

// One line on standard error, whatever a client put into it.
void logLine(const std::string& text) {
    const std::string line = "qelosim: serve: " + displayText(text) + "\n";
    [[maybe_unused]] const ssize_t written = write(STDERR_FILENO, line.data(), line.size());
}

// Tells, through a descriptor, that the process has been asked to end. A signal handler
// rather than a blocked signal: the programs that providers start would inherit a block.
class EndRequest {
public:
    EndRequest() {
        event() = eventfd(0, EFD_CLOEXEC);
        if (event() < 0) {
            throw std::system_error(errno, std::generic_category(), "eventfd");
        }
        struct sigaction action = {};
        action.sa_handler = [](int) {
            const int error = errno;
            const std::uint64_t one = 1;
            [[maybe_unused]] const ssize_t done = write(event(), &one, sizeof one);
            errno = error;
        };
        sigaction(SIGTERM, &action, &terminate_);
        sigaction(SIGINT, &action, &interrupt_);
    }
    ~EndRequest() {
        sigaction(SIGTERM, &terminate_, nullptr);
        sigaction(SIGINT, &interrupt_, nullptr);
        close(event());
    }
    EndRequest(const EndRequest&) = delete;
    EndRequest& operator=(const EndRequest&) = delete;

    void wait() const {
        std::uint64_t count = 0;
        while (read(event(), &count, sizeof count) < 0 && errno == EINTR) {
        }
    }

private:
    static int& event() {
        static int descriptor = -1;
        return descriptor;
    }
    struct sigaction terminate_ = {};
    struct sigaction interrupt_ = {};
};

ListenAddress listenAddressOf(const ServeOptions& options) {
    const auto address = parseListenAddress(options.listen);
    if (!address) {
        throw UsageError("--listen: ADDRESS:PORT is expected, with an IPv6 address in brackets");
    }
    try {
        const bool loopback = server::isLoopback(address->address);
        if (options.noAuthentication && !loopback) {
            throw UsageError("--no-auth is for loopback addresses only");
        }
        if (!loopback && !options.tls()) {
            logLine("warning: passwords cross the network unprotected without --tls-cert and "
                    "--tls-key");
        }
    } catch (const UsageError&) {
        throw;
    } catch (const std::runtime_error& error) {
        throw UsageError(std::string("--listen: ") + error.what());
    }
    return *address;
}

std::shared_ptr<const server::PasswordChecker> passwordsOf(const ServeOptions& options) {
    if (options.noAuthentication) {
        return nullptr;
    }
    if (options.userFile.empty()) {
        return server::pamChecker(kPamService);
    }
    try {
        return server::userFileChecker(options.userFile);
    } catch (const std::runtime_error& error) {
        throw UsageError(error.what());
    }
}

// Without authentication nobody is root, so the accounts of this machine stay as they are;
// a scratch root directory or a node file is there to be played with.
std::function<bool(const std::string&)> permissionOf(const ServeOptions& options) {
    if (options.noAuthentication) {
        return [](const std::string&) { return !changesThisMachine(); };
    }
    return [permissions = server::Permissions(options.methodGroup)](const std::string& user) {
        return permissions.mayChange(user);
    };
}

server::ServerOptions serverOptionsOf(const ServeOptions& options, const ListenAddress& address) {
    server::ServerOptions result;
    result.address = address.address;
    result.port = address.port.value_or(options.tls() ? kTlsPort : kPlainPort);
    if (options.tls()) {
        result.certificate = readWhole(options.certificateFile);
        result.key = readKey(options.keyFile);
    }
    result.passwords = passwordsOf(options);
    result.log = logLine;
    return result;
}

void serve(CommandContext& context, const ServeOptions& options) {
    limitThreadCaches();
    // Memory of a large answer is to go back to the system; with an arena for each worker much
    // of it would stay.
    mallopt(M_ARENA_MAX, 2);
    const ListenAddress address = listenAddressOf(options);
    server::ServerOptions serverOptions = serverOptionsOf(options, address);
    const LocalObjectManager manager = openLocalObjectManager(context.options());
    for (const std::string& warning : manager.warnings) {
        logLine("warning: " + warning);
    }
    const auto operations = std::make_shared<const server::Operations>(server::Operations::Services{
        manager.router, manager.repository, permissionOf(options), hostName()});
    const EndRequest endRequest;
    const server::HttpServer server(std::move(serverOptions), operations);
    const ListenAddress bound = {address.address, server.port()};
    context.output().write(std::string("listening on ") + (options.tls() ? "https" : "http") +
                           "://" + bound.text(0) + "\n");
    context.output().flush();
    endRequest.wait();
}

} // namespace

void addServeCommand(CLI::App& app, Invocation& invocation) {
    const auto options = std::make_shared<ServeOptions>();
    options->listen = "127.0.0.1";
    CLI::App* command =
        addCommand(app, invocation, "serve", "Serve CIM clients over HTTP or HTTPS",
                   [options](CommandContext& context) { serve(context, *options); });
    command
        ->add_option("--listen", options->listen,
                     "Where to listen: ADDRESS:PORT, numeric (127.0.0.1:5988, with TLS :5989); "
                     "port 0 for any free one")
        ->type_name("ADDRESS");
    auto* certificate = command->add_option("--tls-cert", options->certificateFile,
                                            "Speak TLS, with this certificate (PEM)");
    auto* key = command->add_option("--tls-key", options->keyFile,
                                    "The private key of the certificate (PEM)");
    certificate->needs(key)->type_name("FILE");
    key->needs(certificate)->type_name("FILE");
    auto* users = command->add_option("--user-file", options->userFile,
                                      "Take users from lines user:hash (crypt) instead of PAM");
    users->type_name("FILE");
    auto* group = command->add_option("--method-group", options->methodGroup,
                                      "Members of this group may call methods, as root may");
    group->type_name("GROUP");
    command
        ->add_flag("--no-auth", options->noAuthentication,
                   "Ask nobody for a password; on loopback addresses only. Methods that would "
                   "change this machine's own accounts are refused then")
        ->excludes(users)
        ->excludes(group);
}

} // namespace qelo::cli
