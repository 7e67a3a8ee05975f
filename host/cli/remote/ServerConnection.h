// The object manager is a server somewhere else.
#pragma once

#include "../Options.h"

#include <client/Connection.h>

#include <memory>

namespace qelo::cli {

// A connection to the server of the options, as a ConnectionFactory makes it. A password that
// the url lacks comes from the file of the options, or else from the terminal. Nothing is
// sent yet. Throws UsageError.
std::unique_ptr<client::Connection> connectToServer(const Options& options);

} // namespace qelo::cli
