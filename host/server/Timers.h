// Things to do later, carried out one after the other by a thread of their own. For short
// actions only: one that blocks delays all others.
#pragma once

#include <chrono>
#include <condition_variable>
#include <functional>
#include <map>
#include <mutex>
#include <thread>

namespace qelo::server {

class Timers {
public:
    using Clock = std::chrono::steady_clock;
    using Action = std::function<void()>; // must not throw

    Timers();
    ~Timers(); // as stop()
    Timers(const Timers&) = delete;
    Timers& operator=(const Timers&) = delete;

    // Runs the action once, `delay` from now, or at once in the calling thread when stop()
    // has been called.
    void after(Clock::duration delay, Action action);

    // Runs everything that is still due, now, and ends the thread.
    void stop();

private:
    void work();

    std::mutex mutex_;
    std::condition_variable changed_;
    std::multimap<Clock::time_point, Action> due_;
    bool stopped_ = false;
    std::thread thread_;
};

} // namespace qelo::server
