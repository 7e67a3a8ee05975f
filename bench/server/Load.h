// Many requests over several connections at once.
#pragma once

#include "ServerProcess.h"

#include <cstddef>
#include <string>

namespace qelo::bench {

struct Load {
    double requests = 0;  // answered
    double wall = 0;      // seconds
    double serverCpu = 0; // processor time of the server meanwhile
    double clientCpu = 0; // and of this process
};

// Every connection asks again and again for so many seconds. Throws std::runtime_error when
// an answer is not `bytes` long.
Load load(const ServerProcess& server, const std::string& request, std::size_t bytes,
          unsigned int connections, double seconds);

} // namespace qelo::bench
