#include "StoreLock.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/file.h>
#include <thread>
#include <unistd.h>

namespace qelo::store {

namespace {

constexpr const char* kLockFile = ".qelosim.lock";
constexpr std::chrono::milliseconds kPause{10};

using Clock = std::chrono::steady_clock;

bool isOurLockFile(const struct stat& status) {
    return S_ISREG(status.st_mode) && (status.st_uid == 0 || status.st_uid == ::geteuid());
}

// Whether `file` is still what the name stands for. A lock on a file that was removed in the
// meantime would exclude nobody.
bool isCurrent(const RootDirectory& root, FileSystem& files, int file) {
    struct stat mine {};
    struct stat named {};
    return files.status(file, mine) && files.statusAt(root.etc(), kLockFile, named) &&
           mine.st_dev == named.st_dev && mine.st_ino == named.st_ino;
}

bool lockUntil(int file, Clock::time_point end) {
    while (::flock(file, LOCK_EX | LOCK_NB) != 0) {
        if ((errno != EWOULDBLOCK && errno != EINTR) || Clock::now() >= end) {
            return false;
        }
        std::this_thread::sleep_for(kPause);
    }
    return true;
}

} // namespace

Attempt<StoreLock> StoreLock::take(const RootDirectory& root, FileSystem& files,
                                   std::chrono::milliseconds limit) {
    const auto end = Clock::now() + limit;
    do {
        Descriptor file = files.open(root.etc(), kLockFile, O_RDWR | O_CREAT | O_NONBLOCK, 0600);
        struct stat status {};
        if (!file || !files.status(file.get(), status) || !isOurLockFile(status)) {
            return Refusal{"the lock file of the account database cannot be used"};
        }
        if (!lockUntil(file.get(), end)) {
            break;
        }
        if (isCurrent(root, files, file.get())) {
            return StoreLock(std::move(file));
        }
    } while (Clock::now() < end);
    return Refusal{"another command is still at work"};
}

} // namespace qelo::store
