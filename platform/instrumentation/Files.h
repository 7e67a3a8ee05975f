// The store's only way to the file system and the clock, so that a test can put failing or
// changing files and another time in their place.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace qelo::nodes {

// What tells one state of a file from another. Two equal stamps mean the same content,
// except within the grain of the file system's clock (see Freshness.h).
struct FileStamp {
    int error = 0; // errno when the file could not be looked at; the rest is then 0
    std::uint64_t device = 0;
    std::uint64_t inode = 0;
    std::int64_t size = 0;
    std::int64_t modifiedNs = 0; // nanoseconds since 1970
    std::int64_t changedNs = 0;  // of content or attributes
};

bool operator==(const FileStamp& left, const FileStamp& right);
bool operator!=(const FileStamp& left, const FileStamp& right);

struct FileContent {
    FileStamp stamp; // the state that was read
    int error = 0;   // errno; 0 when `bytes` is the whole content
    std::string bytes;
};

class Files {
public:
    Files() = default;
    virtual ~Files() = default;
    Files(const Files&) = delete;
    Files& operator=(const Files&) = delete;

    // The state of a file; links are followed.
    virtual FileStamp stamp(const std::string& path) = 0;

    // The content of a regular file. A file of more than `limit` bytes gives EFBIG, one that
    // is not a regular file EINVAL. A file that changes meanwhile is read again, a few times.
    virtual FileContent read(const std::string& path, std::size_t limit) = 0;

    // The names in a directory in ascending byte order; none when it cannot be read.
    virtual std::vector<std::string> list(const std::string& directory) = 0;

    // Nanoseconds since 1970, of the clock that files are stamped with.
    virtual std::int64_t now() = 0;
};

// The real files and clock. For any thread.
Files& systemFiles();

// Overwrites a text that held secrets, and empties it.
void wipe(std::string& text);

} // namespace qelo::nodes
