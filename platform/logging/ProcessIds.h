// Who writes a line.
#pragma once

#include <sys/types.h>

namespace qelo::logging {

struct ProcessIds {
    pid_t process;
    pid_t thread;
};

// Of the calling thread. Asks the system once a thread, and again after a fork: two system calls
// would be a good part of what a line costs.
ProcessIds processIds() noexcept;

} // namespace qelo::logging
