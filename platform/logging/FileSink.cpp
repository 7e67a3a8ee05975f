#include "logging/FileSink.h"

#include "logging/LineTime.h"

#include <cerrno>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>

namespace qelo::logging {
namespace {

constexpr std::chrono::seconds kCheckInterval{1};

// What is gathered at most before it is written, but for the last line.
constexpr std::size_t kMostHeld = std::size_t{32} * 1024;

constexpr mode_t kOwnerOnly = S_IRUSR | S_IWUSR;

[[noreturn]] void fail(int error) { throw std::system_error(error, std::generic_category()); }

// 0 where lines may be written to `fd`, else an error number.
int refusalOf(int fd) {
    struct ::stat status {};
    if (::fstat(fd, &status) != 0) {
        return errno;
    }
    if (S_ISCHR(status.st_mode)) {
        return 0;
    }
    return S_ISREG(status.st_mode) && status.st_nlink == 1 ? 0 : EPERM;
}

} // namespace

FileSink::FileSink(std::string path, bool buffered)
    : base_sink(makeLineFormatter()), path_(std::move(path)), buffered_(buffered) {
    if (buffered_) {
        HeldLines::instance().add(*this);
    }
}

FileSink::~FileSink() {
    if (buffered_) {
        HeldLines::instance().remove(*this);
        writeHeld();
    }
}

void FileSink::sink_it_(const spdlog::details::log_msg& message) {
    reopenIfDue();
    if (!file_.isOpen()) {
        fail(openError_);
    }
    gather(message);
    const bool mayWait = buffered_ && message.level < spdlog::level::err &&
                         held_.size() < kMostHeld && heldError_ == 0;
    if (!mayWait || !HeldLines::instance().request()) {
        flush_();
    }
}

void FileSink::gather(const spdlog::details::log_msg& message) {
    const std::size_t before = held_.size();
    try {
        formatter_->format(message, held_);
    } catch (...) {
        held_.resize(before);
        throw;
    }
}

void FileSink::flush_() {
    write();
    const int error = std::exchange(heldError_, 0);
    if (error != 0) {
        fail(error);
    }
}

void FileSink::open() {
    // Not blocking for the sake of FIFOs; it changes nothing for the files that are accepted.
    UniqueFd file(
        ::open(path_.c_str(),
               O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NOCTTY | O_NONBLOCK,
               kOwnerOnly));
    openError_ = file.isOpen() ? refusalOf(file.get()) : errno;
    if (openError_ == 0) {
        file_ = std::move(file);
        torn_ = false;
    }
}

void FileSink::reopenIfDue() {
    const Clock::time_point now = Clock::now();
    if (now < nextCheck_) {
        return;
    }
    nextCheck_ = now + kCheckInterval;
    if (file_.isOpen() && !isStillAtPath()) {
        writeHeld();
        file_.reset();
    }
    if (!file_.isOpen()) {
        open();
    }
}

bool FileSink::isStillAtPath() const {
    struct ::stat opened {};
    struct ::stat named {};
    return ::fstat(file_.get(), &opened) == 0 && ::lstat(path_.c_str(), &named) == 0 &&
           opened.st_dev == named.st_dev && opened.st_ino == named.st_ino;
}

void FileSink::write() {
    if (torn_) {
        torn_ = writeSome("\n", 1) == 0;
    }
    const std::size_t written = torn_ ? 0 : writeSome(held_.data(), held_.size());
    torn_ = torn_ || (written > 0 && held_[written - 1] != '\n');
    held_.clear();
}

// How much of it was written; less than all of it sets heldError_.
std::size_t FileSink::writeSome(const char* bytes, std::size_t size) {
    std::size_t done = 0;
    while (done < size) {
        const ssize_t count = ::write(file_.get(), bytes + done, size - done);
        if (count > 0) {
            done += static_cast<std::size_t>(count);
        } else if (count == 0 || errno != EINTR) {
            heldError_ = count == 0 ? ENOSPC : errno;
            break;
        }
    }
    return done;
}

void FileSink::lockLines() { mutex_.lock(); }

void FileSink::unlockLines() { mutex_.unlock(); }

void FileSink::writeHeld() noexcept {
    if (held_.size() > 0) {
        write();
    }
}

} // namespace qelo::logging
