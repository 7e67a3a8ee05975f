#include "Load.h"

#include "Client.h"
#include "Clock.h"

#include <future>
#include <stdexcept>
#include <vector>

namespace qelo::bench {
namespace {

double askUntil(std::uint16_t port, const std::string& request, std::size_t bytes, double end) {
    Client client(port);
    double requests = 0;
    do {
        if (client.ask(request).bytes != bytes) {
            throw std::runtime_error("an answer differs from the one before");
        }
        ++requests;
    } while (wallSeconds() < end);
    return requests;
}

} // namespace

Load load(const ServerProcess& server, const std::string& request, std::size_t bytes,
          unsigned int connections, double seconds) {
    Load result;
    const double serverBefore = server.cpuSeconds();
    const double clientBefore = cpuSeconds();
    const double began = wallSeconds();
    std::vector<std::future<double>> clients;
    for (unsigned int i = 0; i < connections; ++i) {
        clients.push_back(std::async(std::launch::async, askUntil, server.port(), request, bytes,
                                     began + seconds));
    }
    for (std::future<double>& client : clients) {
        result.requests += client.get();
    }
    result.wall = wallSeconds() - began;
    result.serverCpu = server.cpuSeconds() - serverBefore;
    result.clientCpu = cpuSeconds() - clientBefore;
    return result;
}

} // namespace qelo::bench
