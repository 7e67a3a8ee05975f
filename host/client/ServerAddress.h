// Where a CIM server is: http[s]://[user[:password]@]host[:port]
#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace qelo::client {

struct ServerAddress {
    bool tls = false;
    std::string host; // a name or a number; IPv6 in square brackets
    std::uint16_t port = 0;
    std::string user; // empty: nobody in particular
    std::optional<std::string> password;

    // "https://host:5989", without user and password.
    std::string text() const;
};

// Reads a URL. The port is 5988, or 5989 with TLS, unless it says another one; a path other
// than "/", a query or a fragment is refused. On failure: nothing, and `error` says why
// without repeating the text, which may hold a password.
std::optional<ServerAddress> parseServerUrl(const std::string& text, std::string& error);

} // namespace qelo::client
