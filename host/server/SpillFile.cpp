#include "SpillFile.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <unistd.h>

namespace qelo::server {

bool SpaceBudget::take(std::size_t bytes) {
    std::size_t now = taken_;
    do {
        if (bytes > limit_ - now) {
            return false;
        }
    } while (!taken_.compare_exchange_weak(now, now + bytes));
    return true;
}

void SpaceBudget::giveBack(std::size_t bytes) { taken_ -= bytes; }

SpillFile::~SpillFile() {
    space_.giveBack(static_cast<std::size_t>(writtenTo_));
    if (descriptor_ >= 0) {
        close(descriptor_);
    }
}

bool SpillFile::append(std::string_view bytes) {
    if (!space_.take(bytes.size())) {
        return false;
    }
    if (!open() || !writeAll(bytes)) {
        space_.giveBack(bytes.size());
        return false;
    }
    writtenTo_ += static_cast<off_t>(bytes.size());
    return true;
}

ssize_t SpillFile::take(char* buffer, std::size_t size) {
    const auto left = static_cast<std::size_t>(writtenTo_ - readAt_);
    if (left == 0) {
        return 0;
    }
    ssize_t got = 0;
    do {
        got = pread(descriptor_, buffer, std::min(size, left), readAt_);
    } while (got < 0 && errno == EINTR);
    if (got <= 0) {
        return -1; // what was written is not there any more
    }
    readAt_ += got;
    if (empty()) {
        rewind();
    }
    return got;
}

bool SpillFile::open() {
    if (descriptor_ >= 0) {
        return true;
    }
    const char* const chosen = std::getenv("TMPDIR");
    for (const char* const directory : {chosen, "/var/tmp", "/tmp"}) {
        if (directory != nullptr && *directory != '\0') {
            descriptor_ = ::open(directory, O_TMPFILE | O_RDWR | O_CLOEXEC, 0600);
        }
        if (descriptor_ >= 0) {
            return true;
        }
    }
    return false;
}

// Bytes behind writtenTo_ do not count, so a write that fails half-way leaves nothing.
bool SpillFile::writeAll(std::string_view bytes) const {
    off_t at = writtenTo_;
    while (!bytes.empty()) {
        const ssize_t done = pwrite(descriptor_, bytes.data(), bytes.size(), at);
        if (done < 0 && errno == EINTR) {
            continue;
        }
        if (done <= 0) {
            return false;
        }
        bytes.remove_prefix(static_cast<std::size_t>(done));
        at += done;
    }
    return true;
}

void SpillFile::rewind() {
    space_.giveBack(static_cast<std::size_t>(writtenTo_));
    readAt_ = 0;
    writtenTo_ = 0;
    // A failure leaves old bytes, which the next write replaces.
    [[maybe_unused]] const int result = ftruncate(descriptor_, 0);
}

} // namespace qelo::server
