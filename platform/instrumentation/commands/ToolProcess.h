// The child side of running a tool.
#pragma once

#include <sys/types.h>

namespace qelo::store {

// What the supervising child tells its parent, as one record through a pipe.
struct ToolReport {
    enum Kind : int { kExited, kKilled, kTimedOut, kNotStarted };

    Kind kind;
    // Exit status, signal or errno.
    int code;
};

struct ToolProcess {
    const char* program;
    char* const* arguments;
    char* const* environment;
    int input;
    int error;
    int report;
    long limitSeconds;
};

// Called in a freshly forked child, with all signals blocked. Starts the tool as a child of
// its own, waits for it at most the time limit, kills it if it takes longer, and writes one
// ToolReport. Uses nothing that could wait for a lock held by another thread at the fork.
//
// The process between is what makes the exit status reliable: whatever the calling process
// does with SIGCHLD, here it is known to have its default meaning.
[[noreturn]] void superviseTool(const ToolProcess& process);

} // namespace qelo::store
