// The system log.
#pragma once

#include <spdlog/sinks/base_sink.h>

#include <mutex>

namespace qelo::logging {

// Sends each line to syslog, facility daemon. openlog is never called: its settings belong to
// the whole process, and this library is a guest in object managers that have made their own.
// Lines therefore carry the process's own name.
class SyslogSink final : public spdlog::sinks::base_sink<std::mutex> {
protected:
    void sink_it_(const spdlog::details::log_msg& message) override;
    void flush_() override {}
};

} // namespace qelo::logging
