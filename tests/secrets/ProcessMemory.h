// What a running process holds.
#pragma once

#include "Password.h"

#include <string>
#include <sys/types.h>

namespace qelo::secrets {

// A sanitizer keeps what has been freed, on purpose, and its tables take days to read.
constexpr bool memoryTells() {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    return false;
#else
    return true;
#endif
}

// Everything in the process's memory that it can write: heap, stacks, data. The places and forms
// in which the password is there, a line each; empty: it is nowhere. Throws std::runtime_error
// when the memory cannot be read.
std::string placesInMemory(pid_t process, const Password& password);

// The same once it is empty, or what is left when it has not become so in ten seconds: a server
// has answered before it has cleaned up.
std::string placesThatStay(pid_t process, const Password& password);

// A file of /proc/PROCESS: "cmdline", "environ", "limits"; empty when there is none.
std::string processFile(pid_t process, const std::string& name);

} // namespace qelo::secrets
