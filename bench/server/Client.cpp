#include "Client.h"

#include "Clock.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <stdexcept>
#include <sys/socket.h>
#include <unistd.h>
#include <utility>

namespace qelo::bench {
namespace {

constexpr std::size_t bufferSize = 256UL * 1024;
constexpr std::string_view headerEnd = "\r\n\r\n";
constexpr std::string_view lineEnd = "\r\n";

std::string request(const std::string& method, const std::string& parameter) {
    const std::string body =
        "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">"
        "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><IMETHODCALL NAME=\"" +
        method +
        "\"><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/>"
        "</LOCALNAMESPACEPATH>" +
        parameter + "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>";
    return "POST /cimom HTTP/1.1\r\nHost: localhost\r\n"
           "Content-Type: application/xml; charset=\"utf-8\"\r\nCIMOperation: MethodCall\r\n"
           "CIMMethod: " +
           method + "\r\nCIMObject: root/cimv2\r\nContent-Length: " + std::to_string(body.size()) +
           "\r\n\r\n" + body;
}

// The value of a header line that may be missing.
std::string valueOf(const std::string& header, const std::string& name) {
    const std::size_t begin = header.find("\r\n" + name + ": ");
    if (begin == std::string::npos) {
        return {};
    }
    const std::size_t value = begin + name.size() + 4;
    return header.substr(value, header.find(lineEnd, value) - value);
}

} // namespace

std::string enumerateInstancesRequest(const std::string& className) {
    return request("EnumerateInstances", "<IPARAMVALUE NAME=\"ClassName\"><CLASSNAME NAME=\"" +
                                             className + "\"/></IPARAMVALUE>");
}

std::string getInstanceRequest(const std::string& instanceName) {
    return request("GetInstance",
                   "<IPARAMVALUE NAME=\"InstanceName\">" + instanceName + "</IPARAMVALUE>");
}

Client::Client(std::uint16_t port)
    : socket_(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)), buffer_(bufferSize) {
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(port);
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    if (connect(socket_, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
        close(socket_);
        throw std::runtime_error("the server cannot be reached");
    }
    const int on = 1;
    setsockopt(socket_, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
}

Client::~Client() { close(socket_); }

std::string Client::askForText(const std::string& request) {
    std::string text;
    exchange(request, &text);
    return text;
}

double Client::askForFirst(const std::string& request) {
    beginExchange(request);
    while (answer_.first == 0) {
        if (at_ == end_) {
            receive();
        }
        noteFirst(held());
        at_ = end_;
    }
    return answer_.first;
}

// The header of the answer.
std::string Client::beginExchange(const std::string& request) {
    answer_ = {};
    began_ = wallSeconds();
    send(request);
    std::string header = takeHeader();
    if (header.compare(0, 12, "HTTP/1.1 200") != 0) {
        throw std::runtime_error("the server answers " + header.substr(0, header.find(lineEnd)));
    }
    return header;
}

Client::Answer Client::exchange(const std::string& request, std::string* text) {
    const std::string header = beginExchange(request);
    if (const std::string length = valueOf(header, "Content-Length"); !length.empty()) {
        takeBody(std::strtoul(length.c_str(), nullptr, 10), text);
    } else {
        std::size_t size = 0;
        do {
            size = takeChunkSize();
            takeBody(size, text);
            takeBody(lineEnd.size(), nullptr);
            answer_.bytes -= lineEnd.size();
        } while (size > 0);
    }
    answer_.whole = wallSeconds() - began_;
    return answer_;
}

void Client::send(std::string_view bytes) const {
    while (!bytes.empty()) {
        const ssize_t done = ::send(socket_, bytes.data(), bytes.size(), MSG_NOSIGNAL);
        if (done <= 0) {
            throw std::runtime_error("the server does not take the request");
        }
        bytes.remove_prefix(static_cast<std::size_t>(done));
    }
}

// More, behind what is held.
void Client::receive() {
    if (at_ == end_) {
        at_ = end_ = 0;
    } else if (end_ == buffer_.size()) {
        std::memmove(buffer_.data(), buffer_.data() + at_, end_ - at_);
        end_ -= std::exchange(at_, 0);
    }
    const ssize_t got = recv(socket_, buffer_.data() + end_, buffer_.size() - end_, 0);
    if (got <= 0) {
        throw std::runtime_error("the answer is cut short");
    }
    end_ += static_cast<std::size_t>(got);
}

std::string Client::takeHeader() {
    std::size_t length = 0;
    while ((length = held().find(headerEnd)) == std::string_view::npos) {
        receive();
    }
    std::string header(held().substr(0, length + lineEnd.size()));
    at_ += length + headerEnd.size();
    return header;
}

std::size_t Client::takeChunkSize() {
    std::size_t length = 0;
    while ((length = held().find(lineEnd)) == std::string_view::npos) {
        receive();
    }
    const std::size_t size = std::strtoul(held().data(), nullptr, 16);
    at_ += length + lineEnd.size();
    return size;
}

void Client::takeBody(std::size_t size, std::string* text) {
    answer_.bytes += size;
    while (size > 0) {
        if (at_ == end_) {
            receive();
        }
        const std::size_t taken = std::min(size, end_ - at_);
        noteFirst(held().substr(0, taken));
        if (text != nullptr) {
            text->append(held().data(), taken);
        }
        at_ += taken;
        size -= taken;
    }
}

void Client::noteFirst(std::string_view piece) {
    if (answer_.first == 0 && piece.find("<INSTANCE ") != std::string_view::npos) {
        answer_.first = wallSeconds() - began_;
    }
}

} // namespace qelo::bench
