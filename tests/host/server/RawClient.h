// A client that sends exactly the bytes it is told to, well or ill.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace qelo::server {

class RawClient {
public:
    explicit RawClient(std::uint16_t port);
    ~RawClient();
    RawClient(RawClient&& other) noexcept;
    RawClient(const RawClient&) = delete;
    RawClient& operator=(const RawClient&) = delete;
    RawClient& operator=(RawClient&&) = delete;

    bool isConnected() const { return socket_ >= 0; }

    // False when the server does not take it any more.
    bool send(std::string_view bytes) const;
    void finishSending() const;
    // Closing the connection will tell the other side that something went wrong.
    void resetWhenClosed() const;

    struct Answer {
        int status = 0; // 0: the server closed the connection without an answer
        std::string header;
        std::string body;
        bool complete = false; // the whole body has come

        // The value of a header field, or "".
        std::string field(const std::string& name) const;
    };
    // Waits for one answer.
    Answer receive(std::chrono::seconds patience = std::chrono::seconds(30));

    // Whether the server closes the connection within that time.
    bool isClosedWithin(std::chrono::milliseconds patience);

private:
    bool readMore(std::chrono::steady_clock::time_point end);
    void readBody(Answer& answer, std::chrono::steady_clock::time_point end);
    void readChunks(Answer& answer, std::chrono::steady_clock::time_point end);

    int socket_ = -1;
    std::string buffer_;
};

// A POST to /cimom with the headers that go with an intrinsic method, and its body.
struct Post {
    std::string method = "EnumerateInstanceNames";
    std::string object = "root/test";
    std::string body;
    std::string credentials; // "user:password"; empty: none
    std::string furtherHeaders = {};

    std::string text() const;
};

std::string base64(const std::string& bytes);

} // namespace qelo::server
