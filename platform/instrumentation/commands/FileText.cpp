#include "FileText.h"

#include <array>
#include <cerrno>
#include <fcntl.h>

namespace qelo::store {

namespace {

constexpr std::size_t kMostBytes = std::size_t{64} << 20u;
constexpr int kRemovalTries = 3;
constexpr int kNewFile = O_WRONLY | O_CREAT | O_EXCL;

Refusal unreadable(const std::string& name) { return Refusal{"cannot read " + name}; }

bool writeAll(FileSystem& files, int file, std::string_view text) {
    while (!text.empty()) {
        const ssize_t written = files.write(file, text.data(), text.size());
        if (written <= 0) {
            return false;
        }
        text.remove_prefix(static_cast<std::size_t>(written));
    }
    return true;
}

bool hasOwner(FileSystem& files, int file, const struct stat& wanted) {
    struct stat status {};
    return files.status(file, status) && status.st_uid == wanted.st_uid &&
           status.st_gid == wanted.st_gid;
}

// An ordinary user cannot give a file away, and need not where it is his already.
bool copyOwnerAndMode(FileSystem& files, int file, const struct stat& model) {
    return (hasOwner(files, file, model) || files.changeOwner(file, model.st_uid, model.st_gid)) &&
           files.changeMode(file, model.st_mode & 07777u);
}

bool fillReplacement(FileSystem& files, int directory, const std::string& name,
                     std::string_view text, const struct stat& model) {
    const Descriptor file = files.open(directory, name, kNewFile, 0600);
    return file && copyOwnerAndMode(files, file.get(), model) &&
           writeAll(files, file.get(), text) && files.sync(file.get());
}

} // namespace

Attempt<std::string> readSmallFile(FileSystem& files, int directory, const std::string& name) {
    const Descriptor file = files.open(directory, name, O_RDONLY | O_NONBLOCK);
    struct stat status {};
    if (!file || !files.status(file.get(), status) || !S_ISREG(status.st_mode)) {
        return unreadable(name);
    }
    std::string text;
    std::array<char, 8192> buffer{};
    while (true) {
        const ssize_t count = files.read(file.get(), buffer.data(), buffer.size());
        if (count == 0) {
            return text;
        }
        if (count < 0 || text.size() > kMostBytes) {
            return unreadable(name);
        }
        text.append(buffer.data(), static_cast<std::size_t>(count));
    }
}

Problem writeNewFile(FileSystem& files, int directory, const std::string& name,
                     std::string_view text, mode_t mode) {
    const Descriptor file = files.open(directory, name, kNewFile, 0600);
    if (!file) {
        return "cannot make " + name;
    }
    if (!writeAll(files, file.get(), text) || !files.changeMode(file.get(), mode) ||
        !files.sync(file.get())) {
        removeSurely(files, directory, name);
        return "cannot write " + name;
    }
    return {};
}

std::string draftOf(const std::string& name) { return "." + name + ".qelosim"; }

Problem replaceFile(FileSystem& files, int directory, const std::string& name,
                    std::string_view text) {
    const std::string fresh = draftOf(name);
    struct stat model {};
    if (!files.statusAt(directory, name, model) || !S_ISREG(model.st_mode)) {
        return "cannot find " + name;
    }
    // Left by a process that was killed here; its lock is ours now.
    files.removeFile(directory, fresh);
    if (!fillReplacement(files, directory, fresh, text, model) ||
        !files.rename(directory, fresh, directory, name)) {
        removeSurely(files, directory, fresh);
        return "cannot write " + name;
    }
    // The new content is in place; should the directory not reach the disk, a crash brings
    // back the old content, which is whole too.
    files.sync(directory);
    return {};
}

void removeSurely(FileSystem& files, int directory, const std::string& name) {
    for (int tries = 0; tries < kRemovalTries; ++tries) {
        if (files.removeFile(directory, name) || errno == ENOENT) {
            return;
        }
    }
}

} // namespace qelo::store
