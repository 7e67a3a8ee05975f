// The logger itself: configuration, thresholds and outputs, kept up to date with the file.
#pragma once

#include "logging/ConfigFile.h"
#include "logging/LineFormat.h"
#include "logging/LogConfig.h"
#include "logging/Output.h"

#include <array>
#include <atomic>
#include <chrono>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>

namespace qelo::logging {

// Any thread may call any member. All may throw std::bad_alloc, and nothing else.
class LoggerCore {
public:
    using Clock = std::chrono::steady_clock;

    // Reads the configuration at `configPath`, and again when the file has changed, for which
    // it looks at most once in `checkInterval`.
    LoggerCore(std::string configPath, Clock::duration checkInterval);

    // Counts the configurations read; thresholds hold as long as it stands still. Never 0.
    std::uint32_t generation() const { return generation_.load(std::memory_order_acquire); }

    // No line below this level is admitted, whatever its component. Takes no lock.
    Threshold lowestThreshold(Channel channel) const {
        return lowest_[static_cast<std::size_t>(channel)].load(std::memory_order_relaxed);
    }

    struct Admission {
        std::uint32_t generation;
        std::array<Threshold, kChannels> thresholds;
    };

    // The thresholds of a component and the generation they belong to. Takes a lock: callers
    // with many lines keep the answer.
    Admission admissionOf(std::string_view component) const;

    // Reads the configuration again if it is time to look and the file has changed.
    void refreshIfDue();

    // Writes a line, whatever its level. A line that cannot be written is lost; that it was is
    // told on the log, or on syslog where it is the log that fails.
    void write(Channel channel, const Line& line);

private:
    struct State {
        LogConfig config;
        std::array<std::shared_ptr<Output>, kChannels> outputs;
    };

    std::shared_ptr<const State> state() const;
    void publish(std::shared_ptr<const State> state);
    void reload();
    std::shared_ptr<const State> makeState(const ConfigText& file) const;
    std::shared_ptr<Output> outputFor(const SinkTarget& target, Channel channel) const;
    void reportProblems(const State& state) const;

    const std::string configPath_;
    const Clock::duration checkInterval_;
    std::atomic<Clock::rep> nextCheck_{0};
    std::atomic<std::uint32_t> generation_{0};
    std::array<std::atomic<Threshold>, kChannels> lowest_{};

    mutable std::mutex stateMutex_;
    std::shared_ptr<const State> state_; // guarded by stateMutex_

    std::mutex reloadMutex_; // one reader of the file at a time; guards what follows
    FileStamp stamp_;
    bool settled_ = false;
    ConfigText lastRead_;
};

} // namespace qelo::logging
