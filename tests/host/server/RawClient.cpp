#include "RawClient.h"

#include <cim/ObjectPath.h>

#include <arpa/inet.h>
#include <cstdlib>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>
#include <utility>

namespace qelo::server {
namespace {

using Clock = std::chrono::steady_clock;

int millisecondsUntil(Clock::time_point end) {
    const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(end - Clock::now());
    return left.count() < 0 ? 0 : static_cast<int>(left.count());
}

} // namespace

RawClient::RawClient(std::uint16_t port) : socket_(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)) {
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    if (connect(socket_, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
        close(socket_);
        socket_ = -1;
    }
}

RawClient::RawClient(RawClient&& other) noexcept
    : socket_(std::exchange(other.socket_, -1)), buffer_(std::move(other.buffer_)) {}

RawClient::~RawClient() {
    if (socket_ >= 0) {
        close(socket_);
    }
}

bool RawClient::send(std::string_view bytes) const {
    while (!bytes.empty()) {
        const ssize_t done = ::send(socket_, bytes.data(), bytes.size(), MSG_NOSIGNAL);
        if (done <= 0) {
            return false;
        }
        bytes.remove_prefix(static_cast<std::size_t>(done));
    }
    return true;
}

void RawClient::finishSending() const { shutdown(socket_, SHUT_WR); }

void RawClient::resetWhenClosed() const {
    const linger now = {1, 0};
    setsockopt(socket_, SOL_SOCKET, SO_LINGER, &now, sizeof now);
}

bool RawClient::readMore(Clock::time_point end) {
    pollfd item = {socket_, POLLIN, 0};
    if (poll(&item, 1, millisecondsUntil(end)) != 1) {
        return false;
    }
    char piece[16384];
    const ssize_t got = recv(socket_, piece, sizeof piece, 0);
    if (got <= 0) {
        return false;
    }
    buffer_.append(piece, static_cast<std::size_t>(got));
    return true;
}

std::string RawClient::Answer::field(const std::string& name) const {
    std::size_t at = 0;
    while ((at = header.find("\r\n", at)) != std::string::npos) {
        at += 2;
        const std::size_t colon = header.find(':', at);
        if (colon != std::string::npos && cim::sameName(header.substr(at, colon - at), name)) {
            const std::size_t begin = header.find_first_not_of(' ', colon + 1);
            return header.substr(begin, header.find("\r\n", begin) - begin);
        }
    }
    return "";
}

RawClient::Answer RawClient::receive(std::chrono::seconds patience) {
    const auto end = Clock::now() + patience;
    Answer answer;
    std::size_t headerEnd = 0;
    do {
        while ((headerEnd = buffer_.find("\r\n\r\n")) == std::string::npos) {
            if (!readMore(end)) {
                return answer;
            }
        }
        answer.header = buffer_.substr(0, headerEnd + 2);
        buffer_.erase(0, headerEnd + 4);
        answer.status = static_cast<int>(
            std::strtol(answer.header.c_str() + answer.header.find(' '), nullptr, 10));
    } while (answer.status == 100);
    if (answer.field("Transfer-Encoding") == "chunked") {
        readChunks(answer, end);
    } else {
        readBody(answer, end);
    }
    return answer;
}

void RawClient::readBody(Answer& answer, Clock::time_point end) {
    const std::size_t length = std::strtoul(answer.field("Content-Length").c_str(), nullptr, 10);
    while (buffer_.size() < length && readMore(end)) {
    }
    answer.complete = buffer_.size() >= length;
    answer.body = buffer_.substr(0, length);
    buffer_.erase(0, length);
}

void RawClient::readChunks(Answer& answer, Clock::time_point end) {
    while (true) {
        std::size_t line = 0;
        while ((line = buffer_.find("\r\n")) == std::string::npos) {
            if (!readMore(end)) {
                return;
            }
        }
        const std::size_t size = std::strtoul(buffer_.c_str(), nullptr, 16);
        while (buffer_.size() < line + 2 + size + 2) {
            if (!readMore(end)) {
                return;
            }
        }
        answer.body.append(buffer_, line + 2, size);
        buffer_.erase(0, line + 2 + size + 2);
        if (size == 0) {
            answer.complete = true;
            return;
        }
    }
}

bool RawClient::isClosedWithin(std::chrono::milliseconds patience) {
    const auto end = Clock::now() + patience;
    while (readMore(end)) {
        buffer_.clear();
    }
    return millisecondsUntil(end) > 0;
}

std::string Post::text() const {
    std::string result = "POST /cimom HTTP/1.1\r\nHost: localhost\r\n"
                         "Content-Type: application/xml; charset=\"utf-8\"\r\n"
                         "CIMOperation: MethodCall\r\nCIMMethod: " +
                         method + "\r\nCIMObject: " + object +
                         "\r\nContent-Length: " + std::to_string(body.size()) + "\r\n";
    if (!credentials.empty()) {
        result += "Authorization: Basic " + base64(credentials) + "\r\n";
    }
    return result + furtherHeaders + "\r\n" + body;
}

std::string base64(const std::string& bytes) {
    constexpr char digits[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
    std::string text;
    for (std::size_t i = 0; i < bytes.size(); i += 3) {
        unsigned block = 0;
        for (std::size_t k = 0; k < 3; ++k) {
            block = block << 8U |
                    (i + k < bytes.size() ? static_cast<unsigned char>(bytes[i + k]) : 0U);
        }
        for (std::size_t k = 0; k < 4; ++k) {
            text += i + k <= bytes.size() ? digits[block >> (18U - 6U * k) & 63U] : '=';
        }
    }
    return text;
}

} // namespace qelo::server
