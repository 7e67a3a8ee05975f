#include "logging/ConfigFile.h"

#include "logging/UniqueFd.h"

#include <array>
#include <cerrno>
#include <system_error>

#include <fcntl.h>
#include <time.h>

namespace qelo::logging {
namespace {

constexpr off_t kLargestFile = 256L * 1024;

// Longer than the step of any file system's clock.
constexpr time_t kSettlingSeconds = 2;

bool sameTime(const timespec& left, const timespec& right) {
    return left.tv_sec == right.tv_sec && left.tv_nsec == right.tv_nsec;
}

std::string errorText(int error) { return std::generic_category().message(error); }

// Who can change the configuration decides which files a privileged process appends to.
std::string refusalOf(const struct ::stat& status) {
    if (!S_ISREG(status.st_mode)) {
        return "not a regular file";
    }
    if (status.st_uid != 0 && status.st_uid != ::geteuid()) {
        return "owned by another user";
    }
    if ((status.st_mode & S_IWOTH) != 0) {
        return "writable by everyone";
    }
    return status.st_size > kLargestFile ? "too large" : std::string();
}

ConfigText readAll(int fd) {
    ConfigText result;
    std::array<char, 4096> block{};
    for (;;) {
        const ssize_t count = ::read(fd, block.data(), block.size());
        if (count == 0) {
            return result;
        }
        if (count < 0 && errno == EINTR) {
            continue;
        }
        if (count < 0) {
            return {{}, errorText(errno)};
        }
        result.text.append(block.data(), static_cast<std::size_t>(count));
        if (result.text.size() > static_cast<std::size_t>(kLargestFile)) {
            return {{}, "too large"};
        }
    }
}

} // namespace

FileStamp::FileStamp(const char* path) {
    exists_ = ::stat(path, &status_) == 0;
    if (!exists_) {
        status_ = {};
    }
}

bool FileStamp::operator==(const FileStamp& other) const {
    return exists_ == other.exists_ && status_.st_dev == other.status_.st_dev &&
           status_.st_ino == other.status_.st_ino && status_.st_size == other.status_.st_size &&
           status_.st_mode == other.status_.st_mode && status_.st_uid == other.status_.st_uid &&
           sameTime(status_.st_mtim, other.status_.st_mtim) &&
           sameTime(status_.st_ctim, other.status_.st_ctim);
}

bool FileStamp::isSettled() const {
    return !exists_ || ::time(nullptr) - status_.st_ctim.tv_sec > kSettlingSeconds;
}

ConfigText readConfigFile(const char* path) {
    // Not blocking, so that a FIFO in the file's place cannot hold up the caller.
    const UniqueFd file(::open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY));
    if (!file.isOpen()) {
        const int error = errno;
        return {{}, error == ENOENT ? std::string() : errorText(error)};
    }
    struct ::stat status {};
    if (::fstat(file.get(), &status) != 0) {
        return {{}, errorText(errno)};
    }
    const std::string refusal = refusalOf(status);
    return refusal.empty() ? readAll(file.get()) : ConfigText{{}, refusal};
}

} // namespace qelo::logging
