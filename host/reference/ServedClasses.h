// Which classes the providers serve, and what their instances have, found out by asking them.
#pragma once

#include "ClassReference.h"

#include <filesystem>

namespace qelo::reference {

// The schema of a folder: its classes, in root/cimv2 unless they say otherwise.
schema::ClassRepository readSchema(const std::filesystem::path& folder);

// Every class of the folder's registration files, in their order. Has each provider, whose
// libraries lie in `libraries`, list the instances of its class over a node file that holds one
// node of each type; `scratch` is a folder for that file. Sets QELO_NODE_STORE, so it is to be
// called before other threads run. Throws SchemaError, client::CimError, and
// std::runtime_error when a class has no instance.
std::vector<ServedClass> askProviders(const std::filesystem::path& schemaFolder,
                                      const std::filesystem::path& libraries,
                                      const std::filesystem::path& scratch);

} // namespace qelo::reference
