// A client that costs as little as it can: it sends requests that are ready and throws the
// answers away. One connection, which is kept.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::bench {

// Ready requests.
std::string enumerateInstancesRequest(const std::string& className);
std::string getInstanceRequest(const std::string& instanceName); // an INSTANCENAME element

class Client {
public:
    explicit Client(std::uint16_t port);
    ~Client();
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    struct Answer {
        std::size_t bytes = 0; // of the body
        double first = 0;      // seconds until the first piece of the body with an instance
        double whole = 0;      // seconds until its end
    };
    // Throws std::runtime_error for any answer but "200 OK".
    Answer ask(const std::string& request) { return exchange(request, nullptr); }
    // The same, with the body.
    std::string askForText(const std::string& request);
    // Seconds until the first piece of the body with an instance. The rest is not read: nothing
    // else can be asked on this connection.
    double askForFirst(const std::string& request);

private:
    Answer exchange(const std::string& request, std::string* text);
    std::string beginExchange(const std::string& request);
    void send(std::string_view bytes) const;
    void receive();
    std::string_view held() const { return {buffer_.data() + at_, end_ - at_}; }
    std::string takeHeader();
    std::size_t takeChunkSize();
    void takeBody(std::size_t size, std::string* text);
    void noteFirst(std::string_view piece);

    int socket_;
    std::vector<char> buffer_;
    std::size_t at_ = 0; // what stands before it has been taken
    std::size_t end_ = 0;
    double began_ = 0;
    Answer answer_;
};

} // namespace qelo::bench
