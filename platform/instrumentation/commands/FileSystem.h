// The seam between the command executor and the file system. Every look at a file and every
// change of one goes through it, so that a test can make each fail in turn.
//
// The members are the system calls of a like name and report as these do: false, -1 or an
// invalid descriptor for a failure, with errno set. No call follows a symbolic link in its
// last path part, and names are single parts below an open directory. For any thread.
#pragma once

#include "Descriptor.h"

#include <cstdint>
#include <string>
#include <sys/stat.h>
#include <sys/types.h>
#include <vector>

namespace qelo::store {

class FileSystem {
public:
    virtual ~FileSystem() = default;

    // `flags` are completed by O_NOFOLLOW and O_CLOEXEC.
    virtual Descriptor open(int directory, const std::string& name, int flags, mode_t mode = 0) = 0;
    virtual ssize_t read(int file, char* buffer, std::size_t size) = 0;
    virtual ssize_t write(int file, const char* data, std::size_t size) = 0;
    virtual bool sync(int file) = 0;
    virtual bool changeMode(int file, mode_t mode) = 0;
    virtual bool changeOwner(int file, uid_t owner, gid_t group) = 0;
    // An empty name stands for the open file `directory` itself.
    virtual bool changeOwnerAt(int directory, const std::string& name, uid_t owner,
                               gid_t group) = 0;
    virtual bool status(int file, struct stat& status) = 0;
    virtual bool statusAt(int directory, const std::string& name, struct stat& status) = 0;
    // A number that differs between mounts; between devices only, where the kernel numbers no
    // mounts.
    virtual std::uint64_t mountOf(int file) = 0;
    virtual bool makeDirectory(int directory, const std::string& name, mode_t mode) = 0;
    virtual bool makeSymlink(const std::string& target, int directory, const std::string& name) = 0;
    virtual bool readSymlink(int directory, const std::string& name, std::string& target) = 0;
    virtual bool link(int directory, const std::string& from, const std::string& to) = 0;
    virtual bool rename(int fromDirectory, const std::string& from, int toDirectory,
                        const std::string& to) = 0;
    virtual bool removeFile(int directory, const std::string& name) = 0;
    virtual bool removeDirectory(int directory, const std::string& name) = 0;
    // The names in an open directory, without "." and "..".
    virtual bool list(int directory, std::vector<std::string>& names) = 0;
};

// The real one.
FileSystem& systemFiles();

} // namespace qelo::store
