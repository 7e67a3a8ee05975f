// Logins that succeeded a moment ago: hashing a password is slow on purpose, and a CIM client
// sends its password with every request. Holds no password, only a keyed digest (HMAC-SHA-256,
// RFC 2104, with a random key of this process). Safe from several threads.
#pragma once

#include <array>
#include <chrono>
#include <cstddef>
#include <map>
#include <mutex>
#include <string>

namespace qelo::server {

class LoginCache {
public:
    using Clock = std::chrono::steady_clock;

    // Throws std::runtime_error when the system has no random numbers.
    explicit LoginCache(Clock::duration lifetime, std::size_t capacity = 1024);

    // Whether exactly this login was remembered less than the lifetime ago. A wrong password
    // does not make the right one forgotten.
    bool knows(const std::string& user, const std::string& password) const;
    void remember(const std::string& user, const std::string& password);

private:
    using Digest = std::array<unsigned char, 32>;
    struct Entry {
        Digest digest;
        Clock::time_point until;
    };
    Digest digestOf(const std::string& user, const std::string& password) const;

    const Clock::duration lifetime_;
    const std::size_t capacity_;
    Digest key_{};
    mutable std::mutex mutex_;
    std::map<std::string, Entry> entries_;
};

} // namespace qelo::server
