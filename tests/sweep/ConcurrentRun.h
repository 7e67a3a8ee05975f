// Many threads at work on one object manager for a while.
#pragma once

#include <atomic>
#include <chrono>
#include <cstddef>
#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <vector>

namespace qelo::test {

constexpr std::size_t kConcurrentThreads = 8;

// Counts of one thread or of all, by kind of operation.
class Tally {
public:
    void count(const std::string& kind, std::size_t times = 1) { counts_[kind] += times; }
    void add(const Tally& other);
    std::size_t of(const std::string& kind) const;
    const std::map<std::string, std::size_t>& counts() const { return counts_; }

private:
    std::map<std::string, std::size_t> counts_;
};

// What was wrong, from any thread; keeps the first few texts and counts all.
class Findings {
public:
    void add(const std::string& text);
    std::size_t count() const;
    std::vector<std::string> texts() const;

private:
    mutable std::mutex mutex_;
    std::size_t count_ = 0;
    std::vector<std::string> texts_;
};

class ConcurrentRun {
public:
    // Three seconds, or sixty in the long form of the sweeps.
    ConcurrentRun();

    // The time begins now.
    void restart();

    bool goesOn() const { return std::chrono::steady_clock::now() < end_; }
    // Waits, but not beyond the end.
    void pause(std::chrono::milliseconds time) const;

    // Runs `work(number, tally)` in each of the eight threads and the disturbances in threads
    // of their own. What one of them throws is a finding.
    void run(const std::function<void(std::size_t, Tally&)>& work,
             const std::vector<std::function<void()>>& disturbances);

    Findings& findings() { return findings_; }
    const Tally& tally() const { return tally_; }

    // Prints operations by kind and in all.
    void tell(const std::string& title) const;

private:
    std::chrono::steady_clock::time_point begin_;
    std::chrono::steady_clock::time_point end_;
    std::chrono::steady_clock::duration taken_{};
    Findings findings_;
    std::mutex mutex_;
    Tally tally_;
};

} // namespace qelo::test
