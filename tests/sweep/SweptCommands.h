// The administration commands that system calls are made to fail under.
#pragma once

#include "WatchedCommands.h"

#include <vector>

namespace qelo::test {

std::vector<WatchedCommand> sweptCommands();

} // namespace qelo::test
