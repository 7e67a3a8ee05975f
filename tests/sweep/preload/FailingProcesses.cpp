// Processes, their descriptors and locks. The programs that a watched program starts are watched
// too.
#include "CallCount.h"

#include <cerrno>
#include <cstdarg>
#include <cstring>
#include <fcntl.h>
#include <poll.h>
#include <shadow.h>
#include <spawn.h>
#include <sys/file.h>
#include <sys/wait.h>
#include <unistd.h>

using namespace qelo::sweep;

namespace {

// The environment of a program to be started, with what makes it watched.
class WatchedEnvironment {
public:
    explicit WatchedEnvironment(char* const* given) {
        std::size_t used = 0;
        for (; given != nullptr && *given != nullptr && used < kMost - 4; ++given) {
            if (!isOurs(*given)) {
                entries_[used++] = *given;
            }
        }
        for (char** own = environ; own != nullptr && *own != nullptr; ++own) {
            if (isOurs(*own) && used < kMost - 1) {
                entries_[used++] = *own;
            }
        }
        entries_[used] = nullptr;
    }

    char* const* get() const { return entries_; }

private:
    static constexpr std::size_t kMost = 256;

    static bool isOurs(const char* entry) {
        return std::strncmp(entry, "LD_PRELOAD=", 11) == 0 ||
               std::strncmp(entry, "QELO_FAULT_", 11) == 0;
    }

    char* entries_[kMost];
};

} // namespace

QELO_CALL pid_t fork() noexcept {
    QELO_NEXT(fork)
    return fails("fork") ? -1 : real();
}
QELO_CALL int execve(const char* path, char* const* arguments, char* const* environment) noexcept {
    QELO_NEXT(execve)
    if (fails("execve")) {
        return -1;
    }
    const WatchedEnvironment watched(environment);
    return real(path, arguments, watched.get());
}
QELO_CALL int posix_spawn(pid_t* child, const char* path, const posix_spawn_file_actions_t* actions,
                          const posix_spawnattr_t* attributes, char* const* arguments,
                          char* const* environment) {
    QELO_NEXT(posix_spawn)
    if (fails("posix_spawn")) {
        return errno;
    }
    const WatchedEnvironment watched(environment);
    return real(child, path, actions, attributes, arguments, watched.get());
}
QELO_CALL pid_t waitpid(pid_t child, int* status, int options) {
    QELO_NEXT(waitpid)
    return fails("waitpid") ? -1 : real(child, status, options);
}
QELO_CALL pid_t wait(int* status) {
    QELO_NEXT(wait)
    return fails("wait") ? -1 : real(status);
}
// A tool waits whole seconds for a lock, which here nobody else holds.
QELO_CALL unsigned sleep(unsigned) { return 0; }
QELO_CALL int chdir(const char* path) noexcept {
    QELO_NEXT(chdir)
    return fails("chdir", path) ? -1 : real(path);
}

// ---- Descriptors

QELO_CALL int pipe2(int* ends, int flags) noexcept {
    QELO_NEXT(pipe2)
    return fails("pipe2") ? -1 : real(ends, flags);
}
QELO_CALL int dup2(int from, int to) noexcept {
    QELO_NEXT(dup2)
    return fails("dup2") ? -1 : real(from, to);
}
QELO_CALL int poll(struct pollfd* files, nfds_t count, int timeout) {
    QELO_NEXT(poll)
    return fails("poll") ? -1 : real(files, count, timeout);
}

// The third argument is a number or an address, or there is none: a word in any case.
#define QELO_FCNTL(name)                                                                           \
    QELO_CALL int name(int file, int what, ...) {                                                  \
        QELO_NEXT(name)                                                                            \
        va_list arguments;                                                                         \
        va_start(arguments, what);                                                                 \
        void* const argument = va_arg(arguments, void*);                                           \
        va_end(arguments);                                                                         \
        return fails("fcntl") ? -1 : real(file, what, argument);                                   \
    }
QELO_FCNTL(fcntl)
QELO_FCNTL(fcntl64)

// ---- Locks

QELO_CALL int flock(int file, int operation) noexcept {
    QELO_NEXT(flock)
    return fails("flock") ? -1 : real(file, operation);
}
QELO_CALL int lckpwdf() noexcept {
    QELO_NEXT(lckpwdf)
    return fails("lckpwdf") ? -1 : real();
}
