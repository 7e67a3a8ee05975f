// Everything that clients, good and bad ones, ask of a server.
#pragma once

#include "host/server/RawClient.h"

#include <cstdint>
#include <random>
#include <string>
#include <utility>
#include <vector>

namespace qelo::soak {

// What becomes of a request after its bytes have been sent.
enum class Ending {
    Answered, // the answer is read
    Left,     // the client closes the connection without waiting
    Reset,    // the same, and lets the server know that something went wrong
    HalfSent, // only a part is sent, and the connection is closed
};

// What an answer of status 200 holds.
enum class Reply {
    Any,
    Result,
    Error, // <ERROR CODE=...>
};

struct Request {
    std::string text;
    Ending ending = Ending::Answered;
    int status = 200; // of the answer; 0: the connection may be closed instead
    Reply reply = Reply::Any;
    bool change = false; // a method that may be carried out
};

// One client's sequence, the same for the same seed. `accounts` are names of accounts that
// methods may change; `credentials` are "user:password".
class Requests {
public:
    Requests(std::uint32_t seed, std::string credentials, std::vector<std::string> accounts);

    Request next();

private:
    Request operation();
    Request onClass();
    Request onInstance();
    Request method();
    Request change();
    Request malformed();
    Request broken();
    Request refused();
    Request asked(std::pair<server::Post, Reply> choice) const;
    std::string anyAccount();
    std::size_t any(std::size_t count);

    std::mt19937 random_;
    std::string credentials_;
    std::vector<std::string> accounts_;
};

} // namespace qelo::soak
