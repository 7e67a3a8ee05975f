// The object manager inside this process: providers are loaded from their library and asked
// directly.
#pragma once

#include "../Options.h"

#include <broker/Router.h>
#include <client/Connection.h>
#include <schema/ClassRepository.h>

#include <memory>
#include <string>
#include <vector>

namespace qelo::cli {

// The object manager of this process: whoever answers operations, and the classes it knows.
struct LocalObjectManager {
    std::shared_ptr<broker::Router> router;
    std::shared_ptr<const schema::ClassRepository> repository;
    std::vector<std::string> warnings; // one line each about what the registrations say
};

// Knows the classes and the providers that the schema names. Puts the store of the options
// into the environment first (QELO_NODE_STORE), so call it before other threads run. Throws
// StoreError when the store that is chosen, or the schema, cannot be read.
LocalObjectManager openLocalObjectManager(const Options& options);

// A connection to it, as a ConnectionFactory makes it.
std::unique_ptr<client::Connection> connectToLocalProviders(const Options& options);

// Where provider libraries are looked for: the directories of the options, or else "lib"
// beside the directory of the executable and the place where they are installed.
std::vector<std::string> providerDirectories(const Options& options);

// Whether the store that counts now is the machine's own account database.
bool changesThisMachine();

// Why the store cannot be read, as a line of text; empty when it can be, or when the text
// names a kind of store that only the platform knows.
std::string storeProblem(const std::string& store);

} // namespace qelo::cli
