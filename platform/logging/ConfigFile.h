// The configuration file on disk.
#pragma once

#include <string>

#include <sys/stat.h>

namespace qelo::logging {

// What tells one state of a file from another without reading it.
class FileStamp {
public:
    FileStamp() = default;

    // The present state of `path`, links followed.
    explicit FileStamp(const char* path);

    bool operator==(const FileStamp& other) const;
    bool operator!=(const FileStamp& other) const { return !(*this == other); }

    // Whether a later change would show. A file written within the last moments can change
    // once more without any of its times moving.
    bool isSettled() const;

private:
    bool exists_ = false;
    struct ::stat status_ {};
};

struct ConfigText {
    std::string text;
    std::string refusal; // why the file was not read; empty where it was, or does not exist
};

// Reads `path`. Refused is what is not a regular file, what neither root nor this process's
// user owns, what everyone can write, and what is larger than any sensible configuration.
ConfigText readConfigFile(const char* path);

} // namespace qelo::logging
