// The command that makes this process an object manager for others.
#pragma once

#include "../CommandLine.h"

namespace qelo::cli {

// `serve`: CIM-XML over HTTP and HTTPS until SIGTERM or SIGINT.
void addServeCommand(CLI::App& app, Invocation& invocation);

} // namespace qelo::cli
