// A library to be loaded before all others, in which the system calls of the write path count
// and one of them fails. The programs that a watched program starts are watched too.
//
// Everything here runs inside programs under test, between fork and exec as well: no memory is
// allocated, and nothing but system calls is used.
#include "FaultPlan.h"

#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

using qelo::sweep::FaultPlan;

#define QELO_CALL extern "C" __attribute__((visibility("default")))

namespace {

FaultPlan* plan = nullptr;
const char* root = nullptr;

template <class Function> Function next(Function, const char* name) {
    return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

// The function that is hidden by the one here, looked up once.
#define QELO_NEXT(name) static const auto real = next(&::name, #name);

void mapPlan() {
    const char* path = std::getenv(qelo::sweep::kPlanVariable);
    root = std::getenv(qelo::sweep::kRootVariable);
    if (path == nullptr || root == nullptr) {
        return;
    }
    static const auto realOpen =
        reinterpret_cast<int (*)(const char*, int, ...)>(dlsym(RTLD_NEXT, "open"));
    const int file = realOpen(path, O_RDWR | O_CLOEXEC);
    void* memory =
        file < 0 ? MAP_FAILED
                 : mmap(nullptr, sizeof(FaultPlan), PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
    if (file >= 0) {
        close(file);
    }
    plan = memory == MAP_FAILED ? nullptr : static_cast<FaultPlan*>(memory);
}

__attribute__((constructor)) void begin() { mapPlan(); }

void append(char*& place, const char* end, const char* text) {
    while (*text != '\0' && place + 1 < end) {
        *place++ = *text++;
    }
    *place = '\0';
}

void note(const char* call) {
    char* place = plan->failed;
    const char* const end = plan->failed + sizeof plan->failed;
    append(place, end, program_invocation_short_name);
    append(place, end, ": ");
    append(place, end, call);
}

// Counts a call; true when it is to fail, with errno set.
bool fails(const char* call, const char* path = nullptr) {
    if (plan == nullptr) {
        return false;
    }
    if (path != nullptr && std::strncmp(path, root, std::strlen(root)) == 0) {
        plan->begun = 1;
    }
    if (plan->begun == 0) {
        return false;
    }
    const long number = __atomic_add_fetch(&plan->calls, 1, __ATOMIC_SEQ_CST);
    if (plan->failAt == 0 || number < plan->failAt || number > plan->failUntil) {
        return false;
    }
    if (number == plan->failAt) {
        note(call);
    }
    if (plan->kill != 0) {
        ::kill(getpid(), SIGKILL);
    }
    errno = plan->error;
    return true;
}

mode_t modeOf(int flags, va_list arguments) {
    const bool makes = (flags & O_CREAT) != 0 || (flags & O_TMPFILE) == O_TMPFILE;
    return makes ? static_cast<mode_t>(va_arg(arguments, int)) : 0;
}

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

// ---- Opening

#define QELO_OPEN(name)                                                                            \
    QELO_CALL int name(const char* path, int flags, ...) {                                         \
        QELO_NEXT(name)                                                                            \
        va_list arguments;                                                                         \
        va_start(arguments, flags);                                                                \
        const mode_t mode = modeOf(flags, arguments);                                              \
        va_end(arguments);                                                                         \
        return fails(#name, path) ? -1 : real(path, flags, mode);                                  \
    }
QELO_OPEN(open)
QELO_OPEN(open64)

#define QELO_OPENAT(name)                                                                          \
    QELO_CALL int name(int directory, const char* path, int flags, ...) {                          \
        QELO_NEXT(name)                                                                            \
        va_list arguments;                                                                         \
        va_start(arguments, flags);                                                                \
        const mode_t mode = modeOf(flags, arguments);                                              \
        va_end(arguments);                                                                         \
        return fails(#name, path) ? -1 : real(directory, path, flags, mode);                       \
    }
QELO_OPENAT(openat)
QELO_OPENAT(openat64)

QELO_CALL int __open_2(const char* path, int flags) { return open(path, flags); }
QELO_CALL int __open64_2(const char* path, int flags) { return open64(path, flags); }
QELO_CALL int __openat_2(int directory, const char* path, int flags) {
    return openat(directory, path, flags);
}

QELO_CALL FILE* fopen(const char* path, const char* mode) {
    QELO_NEXT(fopen)
    return fails("fopen", path) ? nullptr : real(path, mode);
}
QELO_CALL FILE* fopen64(const char* path, const char* mode) {
    QELO_NEXT(fopen64)
    return fails("fopen", path) ? nullptr : real(path, mode);
}
QELO_CALL FILE* fdopen(int file, const char* mode) noexcept {
    QELO_NEXT(fdopen)
    return fails("fdopen") ? nullptr : real(file, mode);
}

// ---- Writing

QELO_CALL ssize_t write(int file, const void* data, size_t size) {
    QELO_NEXT(write)
    return fails("write") ? -1 : real(file, data, size);
}
QELO_CALL int fflush(FILE* stream) {
    QELO_NEXT(fflush)
    return fails("fflush") ? EOF : real(stream);
}
// A stream that fails to close is closed all the same.
QELO_CALL int fclose(FILE* stream) {
    QELO_NEXT(fclose)
    const bool failed = fails("fclose");
    const int result = real(stream);
    if (failed) {
        errno = plan->error;
        return EOF;
    }
    return result;
}
QELO_CALL int fsync(int file) {
    QELO_NEXT(fsync)
    return fails("fsync") ? -1 : real(file);
}
QELO_CALL int fdatasync(int file) {
    QELO_NEXT(fdatasync)
    return fails("fdatasync") ? -1 : real(file);
}
QELO_CALL int ftruncate(int file, off_t size) noexcept {
    QELO_NEXT(ftruncate)
    return fails("ftruncate") ? -1 : real(file, size);
}
QELO_CALL int ftruncate64(int file, off64_t size) noexcept {
    QELO_NEXT(ftruncate64)
    return fails("ftruncate") ? -1 : real(file, size);
}

// ---- Names

QELO_CALL int rename(const char* from, const char* to) noexcept {
    QELO_NEXT(rename)
    return fails("rename", from) ? -1 : real(from, to);
}
QELO_CALL int renameat(int fromIn, const char* from, int toIn, const char* to) noexcept {
    QELO_NEXT(renameat)
    return fails("renameat", from) ? -1 : real(fromIn, from, toIn, to);
}
QELO_CALL int link(const char* from, const char* to) noexcept {
    QELO_NEXT(link)
    return fails("link", from) ? -1 : real(from, to);
}
QELO_CALL int linkat(int fromIn, const char* from, int toIn, const char* to, int flags) noexcept {
    QELO_NEXT(linkat)
    return fails("linkat", from) ? -1 : real(fromIn, from, toIn, to, flags);
}
QELO_CALL int unlink(const char* path) noexcept {
    QELO_NEXT(unlink)
    return fails("unlink", path) ? -1 : real(path);
}
QELO_CALL int unlinkat(int directory, const char* path, int flags) noexcept {
    QELO_NEXT(unlinkat)
    return fails("unlinkat", path) ? -1 : real(directory, path, flags);
}
QELO_CALL int mkdir(const char* path, mode_t mode) noexcept {
    QELO_NEXT(mkdir)
    return fails("mkdir", path) ? -1 : real(path, mode);
}
QELO_CALL int mkdirat(int directory, const char* path, mode_t mode) noexcept {
    QELO_NEXT(mkdirat)
    return fails("mkdirat", path) ? -1 : real(directory, path, mode);
}
QELO_CALL int symlinkat(const char* target, int directory, const char* path) noexcept {
    QELO_NEXT(symlinkat)
    return fails("symlinkat", path) ? -1 : real(target, directory, path);
}

// ---- Owners and modes

QELO_CALL int chmod(const char* path, mode_t mode) noexcept {
    QELO_NEXT(chmod)
    return fails("chmod", path) ? -1 : real(path, mode);
}
QELO_CALL int fchmod(int file, mode_t mode) noexcept {
    QELO_NEXT(fchmod)
    return fails("fchmod") ? -1 : real(file, mode);
}
QELO_CALL int chown(const char* path, uid_t owner, gid_t group) noexcept {
    QELO_NEXT(chown)
    return fails("chown", path) ? -1 : real(path, owner, group);
}
QELO_CALL int fchown(int file, uid_t owner, gid_t group) noexcept {
    QELO_NEXT(fchown)
    return fails("fchown") ? -1 : real(file, owner, group);
}
QELO_CALL int fchownat(int directory, const char* path, uid_t owner, gid_t group,
                       int flags) noexcept {
    QELO_NEXT(fchownat)
    return fails("fchownat", path) ? -1 : real(directory, path, owner, group, flags);
}

// ---- Processes

QELO_CALL pid_t fork() noexcept {
    QELO_NEXT(fork)
    return fails("fork") ? -1 : real();
}
QELO_CALL int pipe2(int* ends, int flags) noexcept {
    QELO_NEXT(pipe2)
    return fails("pipe2") ? -1 : real(ends, flags);
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
                          char* const* environment) noexcept {
    QELO_NEXT(posix_spawn)
    if (fails("posix_spawn")) {
        return errno;
    }
    const WatchedEnvironment watched(environment);
    return real(child, path, actions, attributes, arguments, watched.get());
}
