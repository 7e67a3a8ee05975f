// The object manager inside this process: providers are loaded from their library and asked
// directly.
#pragma once

#include "../Options.h"

#include <client/Connection.h>

#include <memory>
#include <string>
#include <vector>

namespace qelo::cli {

// A connection to the providers of the known classes, as a ConnectionFactory makes it. Puts
// the store of the options into the environment first (QELO_NODE_STORE), so call it before
// other threads run. Throws StoreError when the store that is chosen cannot be read.
std::unique_ptr<client::Connection> connectToLocalProviders(const Options& options);

// Where provider libraries are looked for: the directories of the options, or else "lib"
// beside the directory of the executable and the place where they are installed.
std::vector<std::string> providerDirectories(const Options& options);

// Why the store cannot be read, as a line of text; empty when it can be, or when the text
// names a kind of store that only the platform knows.
std::string storeProblem(const std::string& store);

} // namespace qelo::cli
