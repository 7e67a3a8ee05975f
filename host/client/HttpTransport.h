// One HTTP connection to a CIM server, kept open between requests.
#pragma once

#include "ServerAddress.h"

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace qelo::client {

struct HttpOptions {
    ServerAddress server;
    std::string caCertificate; // a file of trusted certificates; empty: the system's
    bool insecure = false;     // believe any certificate
    std::chrono::seconds connectTimeout{10};
    std::chrono::seconds idleTimeout{30}; // without a byte in either direction
};

// What DSP0200 says in the head of a request.
struct HttpRequest {
    std::string method; // CIMMethod
    std::string object; // CIMObject, not yet encoded
    std::string body;
    // Whether asking twice does no harm. If so, a kept connection is used, and the request is
    // sent again when it turns out to be dead.
    bool repeatable = true;
};

class HttpTransport {
public:
    // Nothing is sent yet. Throws std::runtime_error when there is no memory or no TLS.
    explicit HttpTransport(HttpOptions options);
    ~HttpTransport();
    HttpTransport(const HttpTransport&) = delete;
    HttpTransport& operator=(const HttpTransport&) = delete;

    // Sends a request and hands on the body of an answer with status 200, piece by piece.
    // Throws Unreachable, CimError (2 when the server wants another user or password, 1 for
    // every other failure) and what `take` throws. Redirects and proxies are not followed.
    void post(const HttpRequest& request, const std::function<void(std::string_view piece)>& take);

private:
    class Impl;
    std::unique_ptr<Impl> impl_;
};

} // namespace qelo::client
