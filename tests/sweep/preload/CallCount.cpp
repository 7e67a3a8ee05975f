#include "CallCount.h"

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <stdio_ext.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace qelo::sweep {

namespace {

FaultPlan* plan = nullptr;
const char* root = nullptr;

// The C library's mark of a stream that met an error, which only it itself sets otherwise.
constexpr int kStreamError = 0x20;

// Of a process, as text with its NUL.
constexpr std::size_t kLongestNumber = 12;

// Past the functions of this library, which would count.
long rawOpen(const char* path) { return syscall(SYS_openat, AT_FDCWD, path, O_RDWR | O_CLOEXEC); }

void mapPlan() {
    const char* path = std::getenv(kPlanVariable);
    root = std::getenv(kRootVariable);
    if (path == nullptr || root == nullptr) {
        return;
    }
    const int file = static_cast<int>(rawOpen(path));
    void* memory =
        file < 0 ? MAP_FAILED
                 : mmap(nullptr, sizeof(FaultPlan), PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
    if (file >= 0) {
        syscall(SYS_close, file);
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

bool isCounting(const char* path) {
    if (plan == nullptr) {
        return false;
    }
    if (path != nullptr && std::strncmp(path, root, std::strlen(root)) == 0) {
        plan->begun = 1;
    }
    return plan->begun != 0;
}

bool concernsAnyCall() { return plan->way == FaultWay::Error || plan->way == FaultWay::Kill; }

enum class Turn { Before, Now, After };

Turn count(const char* call) {
    const long number = __atomic_add_fetch(&plan->calls, 1, __ATOMIC_SEQ_CST);
    if (plan->failAt == 0 || number < plan->failAt) {
        return Turn::Before;
    }
    // A call that succeeds has to leave errno alone.
    if (number == plan->failAt || plan->way == FaultWay::Full) {
        errno = plan->error;
    }
    if (number > plan->failAt) {
        return Turn::After;
    }
    note(call);
    if (plan->way == FaultWay::Kill) {
        ::kill(getpid(), SIGKILL);
    }
    return Turn::Now;
}

bool isPlainFile(int file) {
    struct stat status {};
    return syscall(SYS_newfstatat, file, "", &status, AT_EMPTY_PATH) == 0 &&
           S_ISREG(status.st_mode);
}

void loseHalf(std::FILE* stream) {
    const std::size_t pending = __fpending(stream);
    const int error = errno;
    if (pending != 0) {
        syscall(SYS_write, stream->_fileno, stream->_IO_write_base, pending / 2);
        __fpurge(stream);
    }
    stream->_flags |= kStreamError;
    errno = error;
}

// Of a call that needs room for data, or for half of it.
Written writtenWhereFull(const char* call) {
    switch (count(call)) {
    case Turn::Before:
        return Written::All;
    case Turn::Now:
        return Written::Half;
    case Turn::After:
        break;
    }
    return Written::Nothing;
}

} // namespace

bool fails(const char* call, const char* path) {
    return isCounting(path) && concernsAnyCall() && count(call) == Turn::Now;
}

bool failsForRoom(const char* call, const char* path) {
    if (!isCounting(path) || plan->way != FaultWay::Full) {
        return fails(call, path);
    }
    return count(call) != Turn::Before;
}

Written written(const char* call, int file, std::size_t size) {
    if (!isCounting(nullptr)) {
        return Written::All;
    }
    if (concernsAnyCall()) {
        return count(call) == Turn::Now ? Written::Nothing : Written::All;
    }
    // A single byte has no half, and a pipe takes a small record as a whole.
    if (size < 2 || !isPlainFile(file)) {
        return Written::All;
    }
    // A tool that cannot write its number into a lock tells only the superuser why, so that for
    // others each command would wait for the lock for a minute.
    if (plan->way == FaultWay::Full && size <= kLongestNumber && geteuid() != 0) {
        return Written::All;
    }
    if (plan->way == FaultWay::Short) {
        return count(call) == Turn::Now ? Written::Half : Written::All;
    }
    return writtenWhereFull(call);
}

bool losesData(const char* call, std::FILE* stream) {
    if (!isCounting(nullptr) || plan->way == FaultWay::Short) {
        return false;
    }
    const bool needsRoom = __fpending(stream) != 0 && isPlainFile(stream->_fileno);
    if (plan->way == FaultWay::Full && !needsRoom) {
        return false;
    }
    const bool lost =
        plan->way == FaultWay::Full ? count(call) != Turn::Before : count(call) == Turn::Now;
    if (lost) {
        loseHalf(stream);
    }
    return lost;
}

bool failsToRead(const char* call, std::FILE* stream) {
    const bool failed = fails(call);
    if (failed) {
        stream->_flags |= kStreamError;
    }
    return failed;
}

} // namespace qelo::sweep
