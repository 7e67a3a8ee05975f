// A file that several processes can append lines to.
#pragma once

#include "logging/HeldLines.h"
#include "logging/UniqueFd.h"

#include <spdlog/sinks/base_sink.h>

#include <chrono>
#include <mutex>
#include <string>

namespace qelo::logging {

// Writes whole lines at the end of the file, however many processes do so. The file is created
// for its owner only; a link, a FIFO or a file with a second name is refused, since a privileged
// process would otherwise write where somebody else points it. A file that was moved away, as
// log rotation does, is created anew within a second.
//
// A buffered sink gathers lines for some milliseconds and writes many by one write(), which is
// most of what a line costs; a line of a failure is written at once, with those before it. A
// process that is killed or crashes loses what was gathered; one that ends does not.
//
// log() throws std::exception or what derives from it when the line, or one gathered before it,
// could not be written. Any thread may call it.
class FileSink final : public spdlog::sinks::base_sink<std::mutex>, private LineHolder {
public:
    // Nothing is opened before the first line.
    FileSink(std::string path, bool buffered);
    ~FileSink() override;
    FileSink(const FileSink&) = delete;
    FileSink& operator=(const FileSink&) = delete;

protected:
    void sink_it_(const spdlog::details::log_msg& message) override;
    void flush_() override;

private:
    using Clock = std::chrono::steady_clock;

    void open();
    void reopenIfDue();
    bool isStillAtPath() const;
    void gather(const spdlog::details::log_msg& message);
    void write();
    std::size_t writeSome(const char* bytes, std::size_t size);

    void lockLines() override;
    void unlockLines() override;
    void writeHeld() noexcept override;

    std::string path_;
    const bool buffered_;
    spdlog::memory_buf_t held_; // whole lines
    int heldError_ = 0;         // why earlier ones were lost
    UniqueFd file_;
    int openError_ = 0;
    Clock::time_point nextCheck_{};
    bool torn_ = false; // the last line in the file lacks its end
};

} // namespace qelo::logging
