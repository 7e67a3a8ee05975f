#include "logging/SyslogSink.h"

#include <algorithm>

#include <syslog.h>

namespace qelo::logging {
namespace {

// What system loggers take at least; some drop longer messages whole.
constexpr std::size_t kLongestMessage = std::size_t{7} * 1024;

} // namespace

void SyslogSink::sink_it_(const spdlog::details::log_msg& message) {
    const int priority = message.level >= spdlog::level::err ? LOG_ERR : LOG_INFO;
    const auto size = static_cast<int>(std::min(message.payload.size(), kLongestMessage));
    ::syslog(LOG_DAEMON | priority, "%.*s", size, message.payload.data());
}

} // namespace qelo::logging
