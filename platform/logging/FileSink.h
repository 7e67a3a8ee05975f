// A file that several processes can append lines to.
#pragma once

#include "logging/UniqueFd.h"

#include <spdlog/sinks/base_sink.h>

#include <chrono>
#include <mutex>
#include <string>

namespace qelo::logging {

// Writes each line by one write() at the end of the file. The file is created for its owner
// only; a link, a FIFO or a file with a second name is refused, since a privileged process
// would otherwise write where somebody else points it. A file that was moved away, as log
// rotation does, is created anew within a second.
//
// log() throws std::exception or what derives from it when the line could not be written.
// Any thread may call it.
class FileSink final : public spdlog::sinks::base_sink<std::mutex> {
public:
    // Nothing is opened before the first line.
    explicit FileSink(std::string path);

protected:
    void sink_it_(const spdlog::details::log_msg& message) override;
    void flush_() override {}

private:
    using Clock = std::chrono::steady_clock;

    void open();
    void reopenIfDue();
    bool isStillAtPath() const;
    void write(const char* bytes, std::size_t size);

    std::string path_;
    UniqueFd file_;
    int openError_ = 0;
    Clock::time_point nextCheck_{};
    bool torn_ = false; // the last line in the file lacks its end
};

} // namespace qelo::logging
