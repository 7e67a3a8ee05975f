// The program qelosim, apart from the process around it: reads the command line, runs the
// command, reports what went wrong and says what to exit with.
#pragma once

#include "CommandContext.h"
#include "Output.h"

#include <functional>
#include <vector>

namespace CLI {
class App;
}

namespace qelo::cli {

struct Invocation;

struct Environment {
    ConnectionFactory connect;
    Output& output; // results and help
    Output& errors; // one line for each error
    // Commands that this process adds to those that need an object manager only.
    std::vector<std::function<void(CLI::App&, Invocation&)>> furtherCommands = {};
    // The ids of groups, by name, where the process can tell; may be empty.
    GroupIds groupIds = {};
    // Why a method call was refused, where the process can tell; may be empty.
    RefusalReason refusalReason = {};
};

// Never throws. The result is the exit status of ExitStatus.h; both outputs are flushed.
int runApplication(int count, const char* const* arguments, const Environment& environment);

} // namespace qelo::cli
