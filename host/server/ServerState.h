// What all exchanges of a server share.
#pragma once

#include "ConnectionWatch.h"
#include "HttpServer.h"
#include "LoginCache.h"
#include "SpillFile.h"
#include "Timers.h"
#include "WorkerPool.h"

#include <atomic>
#include <cstddef>
#include <memory>
#include <optional>
#include <set>
#include <string>

namespace qelo::server {

class Exchange;

// The exchanges that are under way, so that the end of the server can end them.
class ExchangeList {
public:
    void add(const std::shared_ptr<Exchange>& exchange);
    void remove(const std::shared_ptr<Exchange>& exchange);
    std::set<std::shared_ptr<Exchange>> all() const;
    // How many there were so far, when there is none now; nothing otherwise.
    std::optional<std::size_t> countWhenIdle() const;

private:
    mutable std::mutex mutex_;
    std::set<std::shared_ptr<Exchange>> exchanges_;
    std::size_t added_ = 0;
};

struct ServerState {
    ServerState(ServerOptions chosen, std::shared_ptr<const Operations> carriedOutBy)
        : options(std::move(chosen)), operations(std::move(carriedOutBy)),
          spill(options.limits.spill), bodies(options.limits.bodies),
          logins(options.limits.rememberLogin),
          loginPool(options.limits.logins, options.limits.backlog),
          workers(options.limits.workers, options.limits.backlog) {}

    void log(const std::string& line) const {
        if (options.log) {
            options.log(line);
        }
    }

    const ServerOptions options;
    const std::shared_ptr<const Operations> operations;
    SpaceBudget spill;
    SpaceBudget bodies; // room for the bodies of all requests
    LoginCache logins;
    ConnectionWatch watch;
    ExchangeList exchanges;
    std::atomic<bool> stopping{false};
    Timers timers;
    WorkerPool loginPool;
    WorkerPool workers;
};

} // namespace qelo::server
