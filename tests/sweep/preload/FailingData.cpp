// Reading and writing.
#include "CallCount.h"

#include <cerrno>
#include <fcntl.h>
#include <grp.h>
#include <pwd.h>
#include <shadow.h>
#include <unistd.h>

using namespace qelo::sweep;

QELO_CALL ssize_t read(int file, void* data, size_t size) {
    QELO_NEXT(read)
    return fails("read") ? -1 : real(file, data, size);
}
QELO_CALL ssize_t write(int file, const void* data, size_t size) {
    QELO_NEXT(write)
    switch (written("write", file, size)) {
    case Written::All:
        return real(file, data, size);
    case Written::Half:
        return real(file, data, size / 2);
    case Written::Nothing:
        break;
    }
    return -1;
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
// A file that fails to close is closed all the same.
QELO_CALL int close(int file) {
    QELO_NEXT(close)
    const bool failed = fails("close");
    const int error = errno;
    const int result = real(file);
    if (failed) {
        errno = error;
        return -1;
    }
    return result;
}

// ---- Streams. Without getc and putc, with which the tools copy a file into its backup: a call
// for each byte would push all others aside.

QELO_CALL char* fgets(char* line, int size, FILE* stream) {
    QELO_NEXT(fgets)
    return failsToRead("fgets", stream) ? nullptr : real(line, size, stream);
}
QELO_CALL int fflush(FILE* stream) {
    QELO_NEXT(fflush)
    const bool failed = stream == nullptr ? fails("fflush") : losesData("fflush", stream);
    return failed ? EOF : real(stream);
}
QELO_CALL int fclose(FILE* stream) {
    QELO_NEXT(fclose)
    const bool failed = losesData("fclose", stream);
    const int error = errno;
    const int result = real(stream);
    if (failed) {
        errno = error;
        return EOF;
    }
    return result;
}
QELO_CALL int putpwent(const struct passwd* entry, FILE* stream) {
    QELO_NEXT(putpwent)
    return fails("putpwent") ? -1 : real(entry, stream);
}
QELO_CALL int putspent(const struct spwd* entry, FILE* stream) {
    QELO_NEXT(putspent)
    return fails("putspent") ? -1 : real(entry, stream);
}
QELO_CALL int putgrent(const struct group* entry, FILE* stream) {
    QELO_NEXT(putgrent)
    return fails("putgrent") ? -1 : real(entry, stream);
}
