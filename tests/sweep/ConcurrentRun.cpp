#include "ConcurrentRun.h"

#include "SweepCount.h"

#include <algorithm>
#include <exception>
#include <iostream>
#include <thread>

namespace qelo::test {

namespace {

constexpr std::size_t kFindingsKept = 5;

} // namespace

void Tally::add(const Tally& other) {
    for (const auto& [kind, times] : other.counts_) {
        count(kind, times);
    }
}

std::size_t Tally::of(const std::string& kind) const {
    const auto found = counts_.find(kind);
    return found == counts_.end() ? 0 : found->second;
}

void Findings::add(const std::string& text) {
    const std::lock_guard<std::mutex> lock(mutex_);
    ++count_;
    if (texts_.size() < kFindingsKept) {
        texts_.push_back(text);
    }
}

std::size_t Findings::count() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return count_;
}

std::vector<std::string> Findings::texts() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return texts_;
}

ConcurrentRun::ConcurrentRun() { restart(); }

void ConcurrentRun::restart() {
    begin_ = std::chrono::steady_clock::now();
    end_ = begin_ + std::chrono::seconds(isLongSweep() ? 60 : 3);
}

void ConcurrentRun::pause(std::chrono::milliseconds time) const {
    std::this_thread::sleep_until(std::min(end_, std::chrono::steady_clock::now() + time));
}

void ConcurrentRun::run(const std::function<void(std::size_t, Tally&)>& work,
                        const std::vector<std::function<void()>>& disturbances) {
    const auto guarded = [this](const std::function<void()>& body) {
        try {
            body();
        } catch (const std::exception& error) {
            findings_.add(std::string("thrown: ") + error.what());
        }
    };
    std::vector<std::thread> threads;
    for (std::size_t number = 0; number < kConcurrentThreads; ++number) {
        threads.emplace_back([&, number] {
            Tally own;
            guarded([&] { work(number, own); });
            const std::lock_guard<std::mutex> lock(mutex_);
            tally_.add(own);
        });
    }
    for (const auto& disturbance : disturbances) {
        threads.emplace_back([&] { guarded(disturbance); });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    taken_ = std::chrono::steady_clock::now() - begin_;
}

void ConcurrentRun::tell(const std::string& title) const {
    std::size_t all = 0;
    for (const auto& [kind, times] : tally_.counts()) {
        std::cout << "[  SWEEP   ]   " << kind << ": " << times << "\n";
        all += times;
    }
    const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(taken_).count();
    countOperations(title + ", " + std::to_string(kConcurrentThreads) + " threads, " +
                        std::to_string(seconds) + " s, " + std::to_string(findings_.count()) +
                        " findings",
                    all);
}

} // namespace qelo::test
