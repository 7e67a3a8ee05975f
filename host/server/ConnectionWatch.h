// Ends connections that take too long: a client that sends its request byte by byte, or takes
// its answer so, is not idle but keeps a place all the same. Safe from several threads.
#pragma once

#include <chrono>
#include <map>
#include <mutex>

namespace qelo::server {

class ConnectionWatch {
public:
    using Clock = std::chrono::steady_clock;

    // `socket` is watched from add() to remove(), and must stay open in between.
    void add(int socket, Clock::duration allowed);
    void remove(int socket);

    // How long the connection may last from now on.
    void allow(int socket, Clock::duration allowed);
    void allowForEver(int socket) { allow(socket, Clock::duration::max()); }

    // Shuts down what has lasted too long, so that whoever serves it notices.
    void endLate();

private:
    std::mutex mutex_;
    std::map<int, Clock::time_point> deadlines_;
};

} // namespace qelo::server
