// The lock of one account file as the system's tools know it.
#pragma once

#include "Attempt.h"
#include "FileSystem.h"
#include "RootDirectory.h"

#include <chrono>
#include <string>

namespace qelo::store {

// Held as long as it lives. While it is held, useradd, usermod and their like wait or give up
// on the same file, and none of them holds it.
//
// The tools' convention: the lock on FILE is a hard link FILE.lock to a file that holds the
// process number of the holder; one whose process is gone may be removed. For the machine's
// own root the C library's lock (.pwd.lock) is taken first, as the tools do there.
class AccountFileLock {
public:
    static Attempt<AccountFileLock> take(const RootDirectory& root, FileSystem& files,
                                         const std::string& name, std::chrono::milliseconds limit);
    ~AccountFileLock();
    AccountFileLock(AccountFileLock&& other) noexcept;
    AccountFileLock& operator=(AccountFileLock&&) = delete;

private:
    AccountFileLock(FileSystem& files, int etc, std::string name, Descriptor libraryLock);

    FileSystem* files_;
    int etc_;
    // Empty once moved from.
    std::string name_;
    Descriptor libraryLock_;
};

// Whether the process is gone that wrote a lock file, or the file that is linked to a lock's
// name; `lock` is its name in the open directory `etc`. One that cannot be understood counts as
// held.
bool isStaleLock(FileSystem& files, int etc, const std::string& lock);

} // namespace qelo::store
