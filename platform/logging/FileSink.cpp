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

FileSink::FileSink(std::string path) : base_sink(makeLineFormatter()), path_(std::move(path)) {}

void FileSink::sink_it_(const spdlog::details::log_msg& message) {
    reopenIfDue();
    if (!file_.isOpen()) {
        fail(openError_);
    }
    spdlog::memory_buf_t line;
    if (torn_) {
        line.push_back('\n');
    }
    formatter_->format(message, line);
    write(line.data(), line.size());
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

void FileSink::write(const char* bytes, std::size_t size) {
    ssize_t written = -1;
    do {
        written = ::write(file_.get(), bytes, size);
    } while (written < 0 && errno == EINTR);
    if (written < 0) {
        fail(errno);
    }
    torn_ = static_cast<std::size_t>(written) < size;
    if (torn_) {
        fail(ENOSPC);
    }
}

} // namespace qelo::logging
