#include "logging/Output.h"

#include "logging/FileSink.h"
#include "logging/LineTime.h"
#include "logging/SyslogSink.h"

#include <spdlog/details/log_msg.h>
#include <spdlog/sinks/stdout_sinks.h>

#include <utility>

namespace qelo::logging {
namespace {

std::unique_ptr<spdlog::sinks::sink> makeStderrSink() {
    auto sink = std::make_unique<spdlog::sinks::stderr_sink_mt>();
    sink->set_formatter(makeLineFormatter());
    return sink;
}

std::unique_ptr<spdlog::sinks::sink> makeSink(const SinkTarget& target) {
    switch (target.kind) {
    case SinkKind::Syslog:
        return std::make_unique<SyslogSink>();
    case SinkKind::Stderr:
        return makeStderrSink();
    case SinkKind::File:
        return std::make_unique<FileSink>(target.path, target.buffered);
    case SinkKind::None:
        break;
    }
    return nullptr;
}

spdlog::level::level_enum severityOf(int level) {
    return level >= kFailureLevel ? spdlog::level::err : spdlog::level::info;
}

} // namespace

Output::Output(SinkTarget target) : target_(std::move(target)), sink_(makeSink(target_)) {}

std::optional<std::string> Output::write(int level, std::string_view line) {
    if (sink_ == nullptr) {
        return std::nullopt;
    }
    try {
        sink_->log(spdlog::details::log_msg(spdlog::string_view_t(), severityOf(level),
                                            spdlog::string_view_t(line.data(), line.size())));
        failing_.store(false, std::memory_order_relaxed);
    } catch (const std::exception& failure) {
        if (!failing_.exchange(true, std::memory_order_relaxed)) {
            return failure.what();
        }
    }
    return std::nullopt;
}

} // namespace qelo::logging
