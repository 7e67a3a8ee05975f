// A file system in which one call fails.
#pragma once

#include "PosixFileSystem.h"

#include <cerrno>

namespace qelo::test {

// Counts its calls and lets one of them fail without doing anything.
class FaultyFiles : public store::PosixFileSystem {
public:
    // `number` counts from 0; `error` is what errno becomes.
    void failAt(long number, int error) {
        faultyCall_ = number;
        error_ = error;
    }
    // All calls from this one on fail.
    void failFrom(long number, int error) {
        failAt(number, error);
        allFurther_ = true;
    }
    long calls() const { return calls_; }

    store::Descriptor open(int directory, const std::string& name, int flags,
                           mode_t mode) override {
        return fails() ? store::Descriptor() : PosixFileSystem::open(directory, name, flags, mode);
    }
    ssize_t read(int file, char* buffer, std::size_t size) override {
        return fails() ? -1 : PosixFileSystem::read(file, buffer, size);
    }
    ssize_t write(int file, const char* data, std::size_t size) override {
        return fails() ? -1 : PosixFileSystem::write(file, data, size);
    }
    bool sync(int file) override { return !fails() && PosixFileSystem::sync(file); }
    bool changeMode(int file, mode_t mode) override {
        return !fails() && PosixFileSystem::changeMode(file, mode);
    }
    bool changeOwner(int file, uid_t owner, gid_t group) override {
        return !fails() && PosixFileSystem::changeOwner(file, owner, group);
    }
    bool changeOwnerAt(int directory, const std::string& name, uid_t owner, gid_t group) override {
        return !fails() && PosixFileSystem::changeOwnerAt(directory, name, owner, group);
    }
    bool status(int file, struct stat& status) override {
        return !fails() && PosixFileSystem::status(file, status);
    }
    bool statusAt(int directory, const std::string& name, struct stat& status) override {
        return !fails() && PosixFileSystem::statusAt(directory, name, status);
    }
    bool makeDirectory(int directory, const std::string& name, mode_t mode) override {
        return !fails() && PosixFileSystem::makeDirectory(directory, name, mode);
    }
    bool makeSymlink(const std::string& target, int directory, const std::string& name) override {
        return !fails() && PosixFileSystem::makeSymlink(target, directory, name);
    }
    bool readSymlink(int directory, const std::string& name, std::string& target) override {
        return !fails() && PosixFileSystem::readSymlink(directory, name, target);
    }
    bool link(int directory, const std::string& from, const std::string& to) override {
        return !fails() && PosixFileSystem::link(directory, from, to);
    }
    bool rename(int fromDirectory, const std::string& from, int toDirectory,
                const std::string& to) override {
        return !fails() && PosixFileSystem::rename(fromDirectory, from, toDirectory, to);
    }
    bool removeFile(int directory, const std::string& name) override {
        return !fails() && PosixFileSystem::removeFile(directory, name);
    }
    bool removeDirectory(int directory, const std::string& name) override {
        return !fails() && PosixFileSystem::removeDirectory(directory, name);
    }
    bool list(int directory, std::vector<std::string>& names) override {
        return !fails() && PosixFileSystem::list(directory, names);
    }

private:
    bool fails() {
        const long call = calls_++;
        const bool fail =
            call == faultyCall_ || (allFurther_ && faultyCall_ >= 0 && call > faultyCall_);
        if (fail) {
            errno = error_;
        }
        return fail;
    }

    long calls_ = 0;
    long faultyCall_ = -1;
    int error_ = EIO;
    bool allFurther_ = false;
};

} // namespace qelo::test
