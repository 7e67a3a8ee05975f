#include "ScriptedServer.h"

#include <arpa/inet.h>
#include <cerrno>
#include <chrono>
#include <poll.h>
#include <stdexcept>
#include <strings.h>
#include <sys/socket.h>
#include <system_error>
#include <unistd.h>

namespace qelo::client {
namespace {

[[noreturn]] void fail(const char* what) {
    throw std::system_error(errno, std::generic_category(), what);
}

// Bound to a free port of the loopback interface.
int boundSocket(int& port) {
    const int socket = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t length = sizeof address;
    if (socket < 0 || bind(socket, reinterpret_cast<sockaddr*>(&address), length) != 0 ||
        getsockname(socket, reinterpret_cast<sockaddr*>(&address), &length) != 0) {
        fail("bind");
    }
    port = ntohs(address.sin_port);
    return socket;
}

// False when the server has to stop.
bool waitFor(int socket, int stop) {
    pollfd descriptors[] = {{socket, POLLIN, 0}, {stop, POLLIN, 0}};
    return poll(descriptors, 2, -1) > 0 && descriptors[1].revents == 0;
}

std::size_t bodyLength(const SeenRequest& request) {
    const std::string length = request.field("Content-Length");
    return length == "(none)" ? 0 : std::stoul(length);
}

} // namespace

std::string SeenRequest::field(const std::string& name) const {
    for (std::size_t start = 0; start < head.size();) {
        const std::size_t end = std::min(head.find("\r\n", start), head.size());
        const std::string line = head.substr(start, end - start);
        if (line.size() > name.size() + 1 && line[name.size()] == ':' &&
            strncasecmp(line.c_str(), name.c_str(), name.size()) == 0) {
            return line.substr(name.size() + 2);
        }
        start = end + 2;
    }
    return "(none)";
}

ScriptedServer::ScriptedServer(Script script) : script_(std::move(script)) {
    listener_ = boundSocket(port_);
    if (listen(listener_, 8) != 0 || pipe(stop_) != 0) {
        fail("listen");
    }
    thread_ = std::thread([this] { run(); });
}

ScriptedServer::~ScriptedServer() {
    close(stop_[1]);
    thread_.join();
    close(stop_[0]);
    close(listener_);
}

std::vector<SeenRequest> ScriptedServer::requests() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return requests_;
}

// A client may open a second connection while it keeps the first.
void ScriptedServer::run() {
    std::vector<std::thread> connections;
    for (int number = 1; waitFor(listener_, stop_[0]); ++number) {
        const int socket = accept4(listener_, nullptr, nullptr, SOCK_CLOEXEC);
        if (socket >= 0) {
            connections.emplace_back([this, socket, number] {
                serve(socket, number);
                close(socket);
            });
        }
    }
    for (std::thread& connection : connections) {
        connection.join();
    }
}

// One connection, until somebody closes it.
void ScriptedServer::serve(int socket, int number) {
    std::string received;
    SeenRequest request;
    while (waitFor(socket, stop_[0])) {
        char buffer[4096];
        const ssize_t count = recv(socket, buffer, sizeof buffer, 0);
        if (count <= 0) {
            return;
        }
        received.append(buffer, static_cast<std::size_t>(count));
        const std::size_t end = received.find("\r\n\r\n");
        if (end == std::string::npos) {
            continue;
        }
        request.head = received.substr(0, end + 4);
        request.connection = number;
        const std::size_t whole = end + 4 + bodyLength(request);
        if (received.size() < whole) {
            continue;
        }
        request.body = received.substr(end + 4, whole - end - 4);
        received.erase(0, whole);
        {
            const std::lock_guard<std::mutex> lock(mutex_);
            requests_.push_back(request);
        }
        const ScriptedAnswer answer = script_(request);
        pollfd stop = {stop_[0], POLLIN, 0};
        poll(&stop, 1, answer.delayMilliseconds);
        send(socket, answer.bytes.data(), answer.bytes.size(), MSG_NOSIGNAL);
        if (answer.close) {
            return;
        }
    }
}

ScriptedAnswer xmlAnswer(const std::string& body) {
    return {"HTTP/1.1 200 OK\r\nContent-Type: application/xml; charset=\"utf-8\"\r\n"
            "CIMOperation: MethodResponse\r\nContent-Length: " +
                std::to_string(body.size()) + "\r\n\r\n" + body,
            false, 0};
}

int deadPort() {
    int port = 0;
    close(boundSocket(port));
    return port;
}

} // namespace qelo::client
