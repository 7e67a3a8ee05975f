#include "ConnectionWatch.h"

#include <sys/socket.h>

namespace qelo::server {
namespace {

ConnectionWatch::Clock::time_point deadline(ConnectionWatch::Clock::duration allowed) {
    using Clock = ConnectionWatch::Clock;
    return allowed == Clock::duration::max() ? Clock::time_point::max() : Clock::now() + allowed;
}

} // namespace

void ConnectionWatch::add(int socket, Clock::duration allowed) {
    const std::lock_guard<std::mutex> lock(mutex_);
    deadlines_[socket] = deadline(allowed);
}

void ConnectionWatch::remove(int socket) {
    const std::lock_guard<std::mutex> lock(mutex_);
    deadlines_.erase(socket);
}

void ConnectionWatch::allow(int socket, Clock::duration allowed) {
    const std::lock_guard<std::mutex> lock(mutex_);
    const auto found = deadlines_.find(socket);
    if (found != deadlines_.end()) {
        found->second = deadline(allowed);
    }
}

void ConnectionWatch::endLate() {
    const std::lock_guard<std::mutex> lock(mutex_);
    for (auto& [socket, end] : deadlines_) {
        if (end <= Clock::now()) {
            shutdown(socket, SHUT_RDWR);
            end = Clock::time_point::max(); // once is enough
        }
    }
}

} // namespace qelo::server
