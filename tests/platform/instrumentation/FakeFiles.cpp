#include "FakeFiles.h"

#include <cerrno>

namespace qelo::nodes::tests {

namespace {

constexpr std::int64_t hourNs = 3'600'000'000'000;
constexpr std::int64_t startNs = 1'700'000'000'123'456'789;

} // namespace

FakeFiles::FakeFiles() : time(startNs) {
    put("/r/.", "");
    put("/r/etc/passwd", "alice:x:1000:1000::/home/alice:/bin/sh\n");
    put("/r/etc/shadow", "alice:$6$h:19000:0:99999:7:::\n");
    put("/r/etc/group", "users:x:1000:alice\n");
}

void FakeFiles::put(const std::string& path, const std::string& content) {
    File file;
    file.content = content;
    file.stamp.inode = ++lastInode_;
    file.stamp.size = static_cast<std::int64_t>(content.size());
    file.stamp.modifiedNs = file.stamp.changedNs = startNs - hourNs;
    files_[path] = file;
}

void FakeFiles::changeUnseen(const std::string& path, const std::string& content) {
    files_[path].content = content;
}

void FakeFiles::setChanged(const std::string& path, std::int64_t nanoseconds) {
    files_[path].stamp.modifiedNs = files_[path].stamp.changedNs = nanoseconds;
}

void FakeFiles::failRead(const std::string& path, int error) { files_[path].readError = error; }

void FakeFiles::remove(const std::string& path) { files_.erase(path); }

FileStamp FakeFiles::stamp(const std::string& path) {
    const auto found = files_.find(path);
    if (found != files_.end()) {
        return found->second.stamp;
    }
    FileStamp missing;
    missing.error = ENOENT;
    return missing;
}

FileContent FakeFiles::read(const std::string& path, std::size_t limit) {
    ++reads[path];
    FileContent content;
    content.stamp = stamp(path);
    content.error = content.stamp.error;
    if (content.error == 0) {
        content.error = files_[path].readError;
    }
    if (content.error == 0 && files_[path].content.size() > limit) {
        content.error = EFBIG;
    }
    if (content.error == 0) {
        content.bytes = files_[path].content;
    }
    if (afterRead) {
        afterRead(path);
    }
    return content;
}

std::vector<std::string> FakeFiles::list(const std::string& directory) {
    std::vector<std::string> names;
    for (const auto& file : files_) {
        if (file.first.rfind(directory + "/", 0) == 0) {
            names.push_back(file.first.substr(directory.size() + 1));
        }
    }
    return names;
}

} // namespace qelo::nodes::tests
