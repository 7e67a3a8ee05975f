#include "Files.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <ctime>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <sys/stat.h>
#include <tuple>
#include <unistd.h>

namespace qelo::nodes {

namespace {

constexpr int readAttempts = 3;
constexpr std::int64_t nsPerSecond = 1'000'000'000;

auto fieldsOf(const FileStamp& stamp) {
    return std::tie(stamp.error, stamp.device, stamp.inode, stamp.size, stamp.modifiedNs,
                    stamp.changedNs);
}

std::int64_t nanoseconds(const timespec& time) {
    return static_cast<std::int64_t>(time.tv_sec) * nsPerSecond + time.tv_nsec;
}

FileStamp stampOf(const struct stat& status) {
    FileStamp stamp;
    stamp.device = status.st_dev;
    stamp.inode = status.st_ino;
    stamp.size = status.st_size;
    stamp.modifiedNs = nanoseconds(status.st_mtim);
    stamp.changedNs = nanoseconds(status.st_ctim);
    return stamp;
}

FileStamp failedStamp(int error) {
    FileStamp stamp;
    stamp.error = error;
    return stamp;
}

class OpenFile {
public:
    // Without blocking, so that a FIFO in the place of a file cannot hold up a request.
    explicit OpenFile(const std::string& path)
        : descriptor_(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK)) {}
    ~OpenFile() {
        if (descriptor_ >= 0) {
            ::close(descriptor_);
        }
    }
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;

    bool isOpen() const { return descriptor_ >= 0; }
    int status(struct stat& status) const { return ::fstat(descriptor_, &status) == 0 ? 0 : errno; }

    // Up to `size` bytes; -1 with errno set on failure.
    ssize_t read(char* bytes, std::size_t size) const {
        ssize_t count = -1;
        do {
            count = ::read(descriptor_, bytes, size);
        } while (count < 0 && errno == EINTR);
        return count;
    }

private:
    int descriptor_;
};

// Makes room without leaving a copy of the content behind in freed memory.
void grow(std::string& bytes, std::size_t size) {
    std::string larger(size, '\0');
    std::copy(bytes.begin(), bytes.end(), larger.begin());
    wipe(bytes);
    bytes.swap(larger);
}

int readToEnd(const OpenFile& file, std::size_t expected, std::size_t limit, std::string& bytes) {
    std::size_t used = 0;
    bytes.assign(expected + 1, '\0');
    for (;;) {
        const ssize_t count = file.read(bytes.data() + used, bytes.size() - used);
        if (count < 0) {
            return errno;
        }
        if (count == 0) {
            break;
        }
        used += static_cast<std::size_t>(count);
        if (used > limit) {
            return EFBIG;
        }
        if (used == bytes.size()) {
            grow(bytes, bytes.size() * 2);
        }
    }
    bytes.resize(used);
    return 0;
}

int readOpen(const OpenFile& file, std::size_t limit, FileContent& content) {
    struct stat before {};
    if (const int error = file.status(before)) {
        return error;
    }
    content.stamp = stampOf(before);
    if (!S_ISREG(before.st_mode)) {
        return EINVAL;
    }
    const auto size = static_cast<std::size_t>(before.st_size);
    return size > limit ? EFBIG : readToEnd(file, size, limit, content.bytes);
}

class SystemFiles : public Files {
public:
    FileStamp stamp(const std::string& path) override {
        struct stat status {};
        return ::stat(path.c_str(), &status) == 0 ? stampOf(status) : failedStamp(errno);
    }

    FileContent read(const std::string& path, std::size_t limit) override {
        FileContent content;
        for (int attempt = 0; attempt < readAttempts; ++attempt) {
            wipe(content.bytes);
            content = readOnce(path, limit);
            if (stamp(path) == content.stamp) {
                break;
            }
        }
        return content;
    }

    std::vector<std::string> list(const std::string& directory) override {
        std::vector<std::string> names;
        const std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(directory.c_str()), ::closedir);
        while (const dirent* entry = stream ? ::readdir(stream.get()) : nullptr) {
            names.emplace_back(static_cast<const char*>(entry->d_name));
        }
        std::sort(names.begin(), names.end());
        return names;
    }

    std::int64_t now() override {
        timespec time{};
        ::clock_gettime(CLOCK_REALTIME, &time);
        return nanoseconds(time);
    }

private:
    FileContent readOnce(const std::string& path, std::size_t limit) {
        FileContent content;
        const OpenFile file(path);
        if (file.isOpen()) {
            content.error = readOpen(file, limit, content);
        } else {
            content.error = errno;
            content.stamp = stamp(path);
        }
        if (content.error != 0) {
            wipe(content.bytes);
        }
        return content;
    }
};

} // namespace

bool operator==(const FileStamp& left, const FileStamp& right) {
    return fieldsOf(left) == fieldsOf(right);
}

bool operator!=(const FileStamp& left, const FileStamp& right) { return !(left == right); }

Files& systemFiles() {
    static SystemFiles files;
    return files;
}

void wipe(std::string& text) {
    ::explicit_bzero(text.data(), text.size());
    text.clear();
}

} // namespace qelo::nodes
