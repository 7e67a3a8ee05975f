// The seam between the command executor and the system's account tools. Every process goes
// through it, so that a test can record the calls and make each fail in turn.
#pragma once

#include "Secret.h"

#include <chrono>
#include <string>
#include <vector>

namespace qelo::store {

struct ToolCall {
    // Absolute path of the program; no search path is used.
    std::string program;
    // Without the program's own name. Visible to every user of the machine, so never a
    // password or a hash.
    std::vector<std::string> arguments;
    // What the tool reads from its standard input; at most 4096 bytes.
    Secret input;
    std::chrono::seconds limit{60};
};

struct ToolResult {
    enum class End { Exited, Killed, TimedOut, NotStarted };

    End end = End::NotStarted;
    // The exit status, or the signal that killed the tool.
    int code = 0;
    // The beginning of what the tool wrote to its standard error.
    std::string message;

    bool done() const { return end == End::Exited && code == 0; }
};

class ToolRunner {
public:
    virtual ~ToolRunner() = default;

    // Runs a tool to its end. The call is not changed or kept.
    virtual ToolResult run(const ToolCall& call) = 0;
};

// Runs tools as processes, by argument vector and never through a shell. The tool sees a
// fixed environment, "/" as its directory, default signal handling, and no descriptor but
// the three standard ones. It is killed when its time is over. For any thread; the signal
// handling of the calling process (an ignored SIGCHLD, a handler that reaps every child)
// does not matter.
ToolRunner& systemTools();

} // namespace qelo::store
