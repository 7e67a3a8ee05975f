// A running `qelosim serve`, on a free loopback port.
#pragma once

#include <string>
#include <sys/types.h>
#include <utility>
#include <vector>

namespace qelo::endtoend {

class Server {
public:
    // Starts it with these further arguments and waits until it listens. Whatever is wrong
    // then shows in url(), which stays empty, and errors().
    explicit Server(std::vector<std::string> arguments);
    ~Server();
    Server(const Server&) = delete;
    Server& operator=(const Server&) = delete;

    // "http://127.0.0.1:40001".
    const std::string& url() const { return url_; }
    // The same with "user:password@" in it.
    std::string urlFor(const std::string& credentials) const;
    // ADDRESS:PORT behind it: "http://127.0.0.1:40001/root/cimv2:Class".
    std::string object(const std::string& path, const std::string& credentials = {}) const;
    std::uint16_t port() const;

    // Asks it to end; its exit status, or 128 + N for signal N.
    int stop();
    // What it wrote to standard error until it ended.
    const std::string& errors() const { return errors_; }
    pid_t process() const { return process_; }

private:
    pid_t process_ = -1;
    int output_ = -1;
    int errorOutput_ = -1;
    std::string url_;
    std::string errors_;
};

// A line "user:hash" for --user-file.
std::string userLine(const std::string& user, const std::string& password);

// A fresh self-signed certificate for 127.0.0.1 and its key, both PEM: {certificate, key}.
std::pair<std::string, std::string> selfSignedCertificate();

} // namespace qelo::endtoend
