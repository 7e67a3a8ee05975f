// Commands that need the machine rather than an object manager.
#pragma once

#include "../CommandLine.h"

namespace qelo::cli {

// `init-root DIR`: makes a scratch root directory to try commands on.
void addRootCommand(CLI::App& app, Invocation& invocation);

} // namespace qelo::cli
