#include "Timers.h"

#include <utility>

namespace qelo::server {

Timers::Timers() : thread_([this] { work(); }) {}

Timers::~Timers() { stop(); }

void Timers::after(Clock::duration delay, Action action) {
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        if (!stopped_) {
            due_.emplace(Clock::now() + delay, std::move(action));
            changed_.notify_one();
            return;
        }
    }
    action();
}

void Timers::stop() {
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        stopped_ = true;
    }
    changed_.notify_one();
    if (thread_.joinable()) {
        thread_.join();
    }
}

void Timers::work() {
    std::unique_lock<std::mutex> lock(mutex_);
    while (!stopped_ || !due_.empty()) {
        if (due_.empty()) {
            changed_.wait(lock);
            continue;
        }
        const auto next = due_.begin();
        if (!stopped_ && next->first > Clock::now()) {
            changed_.wait_until(lock, next->first);
            continue;
        }
        const Action action = std::move(next->second);
        due_.erase(next);
        lock.unlock();
        action();
        lock.lock();
    }
}

} // namespace qelo::server
