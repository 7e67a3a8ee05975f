// What a sweep over system calls and the processes that it watches share: a mapped file, so
// that the count goes on from a process to the tools that it starts.
#pragma once

namespace qelo::sweep {

// The environment variable with the path of the mapped file, and the one with the directory
// below which a file has to lie for the counting to begin.
inline constexpr const char* kPlanVariable = "QELO_FAULT_PLAN";
inline constexpr const char* kRootVariable = "QELO_FAULT_ROOT";

struct FaultPlan {
    int begun;       // whether a file of the root has been asked for
    long calls;      // counted since then
    long failAt;     // the number of the first call that fails, from 1; 0 is none
    long failUntil;  // the number of the last one
    int error;       // the errno that the failed call leaves
    int kill;        // the call ends its process instead
    char failed[96]; // the program and the name of the first call that failed
};

} // namespace qelo::sweep
