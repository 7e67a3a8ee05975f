// The place one channel's lines go to.
#pragma once

#include "logging/LogConfig.h"

#include <spdlog/sinks/sink.h>

#include <atomic>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace qelo::logging {

// Owns a sink and keeps its failures in. Any thread may use it.
class Output {
public:
    // Throws std::bad_alloc.
    explicit Output(SinkTarget target);

    const SinkTarget& target() const { return target_; }

    // Writes a line that formatLine made. Gives the reason where this could not be done for
    // the first time since a line was written; a lasting failure is told once.
    std::optional<std::string> write(int level, std::string_view line);

private:
    SinkTarget target_;
    std::unique_ptr<spdlog::sinks::sink> sink_; // null where lines go nowhere
    std::atomic<bool> failing_{false};
};

} // namespace qelo::logging
