// The same providers and classes as those of the server, in this process: no HTTP.
#pragma once

#include <broker/LocalConnection.h>

#include <filesystem>

namespace qelo::bench {

// `trivialClasses`: the folder of TrivialClasses.
broker::LocalConnection connectInProcess(const std::filesystem::path& trivialClasses);

} // namespace qelo::bench
