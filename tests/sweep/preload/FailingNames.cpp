// Files by their names: opening them, naming them, looking at them.
#include "CallCount.h"

#include <cerrno>
#include <cstdarg>
#include <cstdlib>
#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <utime.h>

using namespace qelo::sweep;

namespace {

mode_t modeOf(int flags, va_list arguments) {
    const bool makes = (flags & O_CREAT) != 0 || (flags & O_TMPFILE) == O_TMPFILE;
    return makes ? static_cast<mode_t>(va_arg(arguments, int)) : 0;
}

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
QELO_CALL int mkstemp(char* path) {
    QELO_NEXT(mkstemp)
    return fails("mkstemp", path) ? -1 : real(path);
}
QELO_CALL DIR* opendir(const char* path) {
    QELO_NEXT(opendir)
    return fails("opendir", path) ? nullptr : real(path);
}
QELO_CALL DIR* fdopendir(int directory) {
    QELO_NEXT(fdopendir)
    return fails("fdopendir") ? nullptr : real(directory);
}
QELO_CALL struct dirent* readdir(DIR* directory) {
    QELO_NEXT(readdir)
    return fails("readdir") ? nullptr : real(directory);
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
    return failsForRoom("mkdir", path) ? -1 : real(path, mode);
}
QELO_CALL int mkdirat(int directory, const char* path, mode_t mode) noexcept {
    QELO_NEXT(mkdirat)
    return failsForRoom("mkdirat", path) ? -1 : real(directory, path, mode);
}
QELO_CALL int rmdir(const char* path) noexcept {
    QELO_NEXT(rmdir)
    return fails("rmdir", path) ? -1 : real(path);
}
QELO_CALL int symlinkat(const char* target, int directory, const char* path) noexcept {
    QELO_NEXT(symlinkat)
    return fails("symlinkat", path) ? -1 : real(target, directory, path);
}

// ---- Owners, modes and times

QELO_CALL int chmod(const char* path, mode_t mode) noexcept {
    QELO_NEXT(chmod)
    return fails("chmod", path) ? -1 : real(path, mode);
}
QELO_CALL int fchmod(int file, mode_t mode) noexcept {
    QELO_NEXT(fchmod)
    return fails("fchmod") ? -1 : real(file, mode);
}
QELO_CALL int fchmodat(int directory, const char* path, mode_t mode, int flags) noexcept {
    QELO_NEXT(fchmodat)
    return fails("fchmodat", path) ? -1 : real(directory, path, mode, flags);
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
QELO_CALL int utime(const char* path, const struct utimbuf* times) noexcept {
    QELO_NEXT(utime)
    return fails("utime", path) ? -1 : real(path, times);
}
QELO_CALL int utimensat(int directory, const char* path, const struct timespec* times,
                        int flags) noexcept {
    QELO_NEXT(utimensat)
    return fails("utimensat", path) ? -1 : real(directory, path, times, flags);
}

// ---- Looking

QELO_CALL int stat(const char* path, struct stat* status) noexcept {
    QELO_NEXT(stat)
    return fails("stat", path) ? -1 : real(path, status);
}
QELO_CALL int lstat(const char* path, struct stat* status) noexcept {
    QELO_NEXT(lstat)
    return fails("lstat", path) ? -1 : real(path, status);
}
QELO_CALL int fstat(int file, struct stat* status) noexcept {
    QELO_NEXT(fstat)
    return fails("fstat") ? -1 : real(file, status);
}
QELO_CALL int fstatat(int directory, const char* path, struct stat* status, int flags) noexcept {
    QELO_NEXT(fstatat)
    return fails("fstatat", path) ? -1 : real(directory, path, status, flags);
}
QELO_CALL int statx(int directory, const char* path, int flags, unsigned mask,
                    struct statx* status) noexcept {
    QELO_NEXT(statx)
    return fails("statx", path) ? -1 : real(directory, path, flags, mask, status);
}
QELO_CALL ssize_t readlink(const char* path, char* target, size_t size) noexcept {
    QELO_NEXT(readlink)
    return fails("readlink", path) ? -1 : real(path, target, size);
}
QELO_CALL ssize_t readlinkat(int directory, const char* path, char* target, size_t size) noexcept {
    QELO_NEXT(readlinkat)
    return fails("readlinkat", path) ? -1 : real(directory, path, target, size);
}
QELO_CALL char* realpath(const char* path, char* resolved) noexcept {
    QELO_NEXT(realpath)
    return fails("realpath", path) ? nullptr : real(path, resolved);
}
// Without access, for what the account tools make of it: a gshadow or subuid that they cannot
// find is none for them, whatever the reason, and so they change the other files and say that all
// is done. A disk that tells so little of a name lets them find nothing else either.
QELO_CALL int faccessat(int directory, const char* path, int mode, int flags) noexcept {
    QELO_NEXT(faccessat)
    return fails("faccessat", path) ? -1 : real(directory, path, mode, flags);
}
