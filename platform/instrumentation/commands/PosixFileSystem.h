// The file system of this machine.
#pragma once

#include "FileSystem.h"

namespace qelo::store {

class PosixFileSystem : public FileSystem {
public:
    Descriptor open(int directory, const std::string& name, int flags, mode_t mode) override;
    ssize_t read(int file, char* buffer, std::size_t size) override;
    ssize_t write(int file, const char* data, std::size_t size) override;
    bool sync(int file) override;
    bool changeMode(int file, mode_t mode) override;
    bool changeOwner(int file, uid_t owner, gid_t group) override;
    bool changeOwnerAt(int directory, const std::string& name, uid_t owner, gid_t group) override;
    bool status(int file, struct stat& status) override;
    bool statusAt(int directory, const std::string& name, struct stat& status) override;
    std::uint64_t mountOf(int file) override;
    bool makeDirectory(int directory, const std::string& name, mode_t mode) override;
    bool makeSymlink(const std::string& target, int directory, const std::string& name) override;
    bool readSymlink(int directory, const std::string& name, std::string& target) override;
    bool link(int directory, const std::string& from, const std::string& to) override;
    bool rename(int fromDirectory, const std::string& from, int toDirectory,
                const std::string& to) override;
    bool removeFile(int directory, const std::string& name) override;
    bool removeDirectory(int directory, const std::string& name) override;
    bool list(int directory, std::vector<std::string>& names) override;
};

} // namespace qelo::store
