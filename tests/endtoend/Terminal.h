// Runs a program on a terminal of its own and keeps what a person would have seen.
#pragma once

#include "Process.h"

namespace qelo::endtoend {

// Standard output is a terminal of that many columns; line ends come back as "\n".
Finished runOnTerminal(std::size_t columns, const std::vector<std::string>& command,
                       const Variables& variables = {});

} // namespace qelo::endtoend
