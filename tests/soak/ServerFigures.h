// What a running process takes of the machine.
#pragma once

#include <cstddef>
#include <optional>
#include <ostream>
#include <sys/types.h>

namespace qelo::soak {

struct ServerFigures {
    std::size_t residentKiB = 0;
    std::size_t threads = 0;
    std::optional<std::size_t> descriptors; // for those who may look
};

std::ostream& operator<<(std::ostream& stream, const ServerFigures& figures);

ServerFigures figuresOf(pid_t process);

// The same as soon as its memory has not changed for seven seconds and it has no more than that
// many descriptors, or after a minute: a server that has nothing to do closes connections that
// were left, ends what they asked for, and gives memory back, a moment later.
ServerFigures figuresAtRest(pid_t process, std::optional<std::size_t> descriptors);

} // namespace qelo::soak
