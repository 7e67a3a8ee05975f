// A queue of bytes in a file without a name: where an answer waits for a client that is
// slower than the provider. It vanishes with the object or the process.
#pragma once

#include <atomic>
#include <cstddef>
#include <string_view>
#include <sys/types.h>

namespace qelo::server {

// How many bytes may be held in all, by several holders. Safe from several threads.
class SpaceBudget {
public:
    explicit SpaceBudget(std::size_t limit) : limit_(limit) {}
    bool take(std::size_t bytes);
    void giveBack(std::size_t bytes);
    std::size_t taken() const { return taken_; }

private:
    const std::size_t limit_;
    std::atomic<std::size_t> taken_{0};
};

// Not safe from several threads.
class SpillFile {
public:
    explicit SpillFile(SpaceBudget& space) : space_(space) {}
    ~SpillFile();
    SpillFile(const SpillFile&) = delete;
    SpillFile& operator=(const SpillFile&) = delete;

    // False when there is no room, here or on the disk; the bytes are not taken then.
    bool append(std::string_view bytes);

    // Takes up to `size` bytes from the front. 0: none are left; negative: the file cannot
    // be read.
    ssize_t take(char* buffer, std::size_t size);

    bool empty() const { return readAt_ == writtenTo_; }

private:
    bool open();
    bool writeAll(std::string_view bytes) const;
    void rewind();

    SpaceBudget& space_;
    int descriptor_ = -1;
    off_t readAt_ = 0;
    off_t writtenTo_ = 0;
};

} // namespace qelo::server
