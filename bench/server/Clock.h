// What time it is, in seconds.
#pragma once

#include <ctime>

namespace qelo::bench {

inline double secondsOf(clockid_t clock) {
    timespec now = {};
    clock_gettime(clock, &now);
    constexpr double nanosecond = 1e-9;
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * nanosecond;
}

inline double wallSeconds() { return secondsOf(CLOCK_MONOTONIC); }
// Processor time of this process.
inline double cpuSeconds() { return secondsOf(CLOCK_PROCESS_CPUTIME_ID); }

} // namespace qelo::bench
