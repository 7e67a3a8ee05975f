// The object manager on the wire: CIM-XML over HTTP and HTTPS (DMTF DSP0200). Every request
// is authenticated before anything else is looked at; providers run in worker threads, so
// neither a slow client nor a slow provider keeps others waiting.
#pragma once

#include "Operations.h"
#include "PasswordChecker.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

namespace qelo::server {

struct ServerLimits {
    std::size_t header = 16UL * 1024;            // bytes of a request's header: 431 beyond
    std::size_t body = 4UL * 1024 * 1024;        // bytes of a request's body: 413 beyond
    std::size_t bodies = 64UL * 1024 * 1024;     // bytes of all bodies at a time: 503 beyond
    unsigned int connections = 1024;             // at a time; further ones wait
    std::chrono::seconds idle{10};               // without a byte in either direction
    std::chrono::seconds request{30};            // from the first byte of a request to its last
    std::size_t answerRate = 8UL * 1024;         // bytes a second that a client must take
    std::size_t workers = 16;                    // operations at a time
    std::size_t logins = 4;                      // passwords checked at a time
    std::size_t backlog = 1024;                  // requests that wait for a worker: 503 beyond
    std::size_t spill = 1024UL * 1024 * 1024;    // bytes of answers waiting in files
    std::chrono::milliseconds failedLogin{1000}; // how long an answer to one is held back
    std::chrono::seconds rememberLogin{30};      // see LoginCache
};

struct ServerOptions {
    std::string address = "127.0.0.1"; // numeric, IPv4 or IPv6
    std::uint16_t port = 5988;         // 0: any free one
    std::string certificate;           // PEM texts; both empty: no TLS
    std::string key;
    // Null: nobody is asked for a password.
    std::shared_ptr<const PasswordChecker> passwords;
    ServerLimits limits;
    // One line about a request that was refused or failed; called from any thread. May be
    // empty. The text may hold anything that a client sent.
    std::function<void(const std::string&)> log;
};

class HttpServer {
public:
    // Listens and serves from now on. Throws std::runtime_error when that is not possible.
    HttpServer(ServerOptions options, std::shared_ptr<const Operations> operations);
    // Refuses new requests, gives those that run a moment to end, and ends the threads.
    ~HttpServer();
    HttpServer(const HttpServer&) = delete;
    HttpServer& operator=(const HttpServer&) = delete;

    std::uint16_t port() const;

private:
    class Impl;
    std::unique_ptr<Impl> impl_;
};

// Whether a numeric address reaches this machine only. Throws std::runtime_error for a text
// that is no numeric address.
bool isLoopback(const std::string& address);

} // namespace qelo::server
