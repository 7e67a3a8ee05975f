// What a sweep over system calls and the processes that it watches share: a mapped file, so
// that the count goes on from a process to the tools that it starts.
#pragma once

namespace qelo::sweep {

// The environment variable with the path of the mapped file, and the one with the directory
// below which a file has to lie for the counting to begin.
inline constexpr const char* kPlanVariable = "QELO_FAULT_PLAN";
inline constexpr const char* kRootVariable = "QELO_FAULT_ROOT";

// What happens at a call. Each way counts the calls that it can happen to, and no others.
enum class FaultWay : int {
    Error, // any call: one fails
    Kill,  // any call: one ends its process
    Short, // write() to a plain file: one writes half of the data, and says so
    Full,  // what needs room on the disk: one writes half of the data, all later ones fail
};

struct FaultPlan {
    int begun;   // whether a file of the root has been asked for
    long calls;  // counted since then
    long failAt; // the number of the first call that it happens to, from 1; 0 is none
    FaultWay way;
    int error;       // the errno that a failed call leaves
    char failed[96]; // the program and the name of the first call that it happened to
};

} // namespace qelo::sweep
