// A root directory of its own to try commands on.
#pragma once

#include "AdminCommand.h"

#include <filesystem>

namespace qelo::store {

// Makes below `directory` (made too when missing) the least that accounts need: an etc with
// the superuser and nobody, their groups, the settings of the account tools and a skeleton,
// and an empty /home. The etc appears complete or not at all. Refused when there is an etc
// that holds anything; nothing that is there is changed. Throws nothing but std::bad_alloc.
CommandOutcome initRoot(const std::filesystem::path& directory);

} // namespace qelo::store
