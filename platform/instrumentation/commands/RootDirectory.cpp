#include "RootDirectory.h"

#include "AccountFileNames.h"

#include <fcntl.h>
#include <unistd.h>

namespace qelo::store {

namespace {

constexpr int kOpenDirectory = O_RDONLY | O_DIRECTORY;

bool isSafeDirectory(FileSystem& files, int directory) {
    struct stat status {};
    return files.status(directory, status) &&
           (status.st_uid == 0 || status.st_uid == ::geteuid()) && (status.st_mode & S_IWOTH) == 0;
}

bool isSameDirectory(FileSystem& files, int directory, const char* path) {
    struct stat mine {};
    struct stat other {};
    return files.status(directory, mine) && ::stat(path, &other) == 0 &&
           mine.st_dev == other.st_dev && mine.st_ino == other.st_ino;
}

bool mayBeMissing(const char* name) {
    return name != std::string(kPasswd) && name != std::string(kShadow) &&
           name != std::string(kGroup);
}

Problem checkAccountFiles(FileSystem& files, int etc) {
    for (const char* name : kAccountFiles) {
        struct stat status {};
        if (!files.statusAt(etc, name, status)) {
            if (!mayBeMissing(name)) {
                return std::string("the root directory has no etc/") + name;
            }
        } else if (!S_ISREG(status.st_mode)) {
            return std::string("etc/") + name + " is not a plain file";
        }
    }
    return {};
}

Problem checkDirectories(FileSystem& files, int top, int etc) {
    if (!isSafeDirectory(files, top) || !isSafeDirectory(files, etc)) {
        return "the root directory or its etc belongs to another user or may be written by all";
    }
    if (::faccessat(etc, ".", W_OK, AT_EACCESS) != 0) {
        return "no permission to change the account files";
    }
    return checkAccountFiles(files, etc);
}

} // namespace

Attempt<RootDirectory> RootDirectory::open(const std::filesystem::path& path, FileSystem& files) {
    const Refusal missing{"the root directory or its etc cannot be opened"};
    std::error_code error;
    RootDirectory root;
    root.path_ = std::filesystem::canonical(path, error).native();
    if (error || path.native().find('\0') != std::string::npos) {
        return missing;
    }
    root.top_ = files.open(AT_FDCWD, root.path_, kOpenDirectory);
    if (!root.top_) {
        return missing;
    }
    root.etc_ = files.open(root.top(), "etc", kOpenDirectory);
    if (!root.etc_) {
        return missing;
    }
    if (Problem problem = checkDirectories(files, root.top(), root.etc())) {
        return Refusal{*problem};
    }
    if (isSameDirectory(files, root.top(), "/")) {
        root.path_ = "/";
    }
    return root;
}

} // namespace qelo::store
