#include "FileSystem.h"

#include "PosixFileSystem.h"

#include <array>
#include <cerrno>
#include <climits>
#include <cstdio>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <string_view>

namespace qelo::store {

Descriptor PosixFileSystem::open(int directory, const std::string& name, int flags, mode_t mode) {
    return Descriptor(::openat(directory, name.c_str(), flags | O_NOFOLLOW | O_CLOEXEC, mode));
}

ssize_t PosixFileSystem::read(int file, char* buffer, std::size_t size) {
    return TEMP_FAILURE_RETRY(::read(file, buffer, size));
}

ssize_t PosixFileSystem::write(int file, const char* data, std::size_t size) {
    return TEMP_FAILURE_RETRY(::write(file, data, size));
}

bool PosixFileSystem::sync(int file) { return ::fsync(file) == 0; }

bool PosixFileSystem::changeMode(int file, mode_t mode) { return ::fchmod(file, mode) == 0; }

bool PosixFileSystem::changeOwner(int file, uid_t owner, gid_t group) {
    return ::fchown(file, owner, group) == 0;
}

bool PosixFileSystem::changeOwnerAt(int directory, const std::string& name, uid_t owner,
                                    gid_t group) {
    return ::fchownat(directory, name.c_str(), owner, group, AT_SYMLINK_NOFOLLOW | AT_EMPTY_PATH) ==
           0;
}

bool PosixFileSystem::status(int file, struct stat& status) { return ::fstat(file, &status) == 0; }

bool PosixFileSystem::statusAt(int directory, const std::string& name, struct stat& status) {
    return ::fstatat(directory, name.c_str(), &status, AT_SYMLINK_NOFOLLOW) == 0;
}

std::uint64_t PosixFileSystem::mountOf(int file) {
    struct statx extended {};
    if (::statx(file, "", AT_EMPTY_PATH, STATX_MNT_ID, &extended) == 0 &&
        (extended.stx_mask & STATX_MNT_ID) != 0) {
        return extended.stx_mnt_id;
    }
    struct stat plain {};
    return ::fstat(file, &plain) == 0 ? plain.st_dev : 0;
}

bool PosixFileSystem::makeDirectory(int directory, const std::string& name, mode_t mode) {
    return ::mkdirat(directory, name.c_str(), mode) == 0;
}

bool PosixFileSystem::makeSymlink(const std::string& target, int directory,
                                  const std::string& name) {
    return ::symlinkat(target.c_str(), directory, name.c_str()) == 0;
}

bool PosixFileSystem::readSymlink(int directory, const std::string& name, std::string& target) {
    std::array<char, PATH_MAX> buffer{};
    const ssize_t length = ::readlinkat(directory, name.c_str(), buffer.data(), buffer.size());
    if (length < 0) {
        return false;
    }
    target.assign(buffer.data(), static_cast<std::size_t>(length));
    return true;
}

bool PosixFileSystem::link(int directory, const std::string& from, const std::string& to) {
    return ::linkat(directory, from.c_str(), directory, to.c_str(), 0) == 0;
}

bool PosixFileSystem::rename(int fromDirectory, const std::string& from, int toDirectory,
                             const std::string& to) {
    return ::renameat(fromDirectory, from.c_str(), toDirectory, to.c_str()) == 0;
}

bool PosixFileSystem::removeFile(int directory, const std::string& name) {
    return ::unlinkat(directory, name.c_str(), 0) == 0;
}

bool PosixFileSystem::removeDirectory(int directory, const std::string& name) {
    return ::unlinkat(directory, name.c_str(), AT_REMOVEDIR) == 0;
}

bool PosixFileSystem::list(int directory, std::vector<std::string>& names) {
    // A descriptor of its own, so that reading starts at the first entry each time.
    const int own = ::openat(directory, ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    const std::unique_ptr<DIR, int (*)(DIR*)> stream(own < 0 ? nullptr : ::fdopendir(own),
                                                     &::closedir);
    if (!stream) {
        const int failure = errno;
        if (own >= 0) {
            ::close(own);
        }
        errno = failure;
        return false;
    }
    errno = 0;
    while (const dirent* entry = ::readdir(stream.get())) {
        const std::string_view name = entry->d_name;
        if (name != "." && name != "..") {
            names.emplace_back(name);
        }
    }
    return errno == 0;
}

FileSystem& systemFiles() {
    static PosixFileSystem files;
    return files;
}

} // namespace qelo::store
