// One command at a time below a root directory, over all threads and processes.
//
// The system's tools lock the account files too, but give up after some seconds (at once for
// an ordinary user), and a command is often more than one tool. So every command first takes
// this lock: a flock on <root>/etc/.qelosim.lock. It needs no clean-up, because the kernel
// drops it with its holder, and nobody without rights on etc can take it and block others.
#pragma once

#include "Attempt.h"
#include "FileSystem.h"
#include "RootDirectory.h"

#include <chrono>

namespace qelo::store {

class StoreLock {
public:
    // Waits at most `limit` for the lock. It is held as long as the result lives.
    static Attempt<StoreLock> take(const RootDirectory& root, FileSystem& files,
                                   std::chrono::milliseconds limit);

private:
    explicit StoreLock(Descriptor file) : file_(std::move(file)) {}

    Descriptor file_;
};

} // namespace qelo::store
