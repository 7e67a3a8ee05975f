// Store nodes that tests start from.
#pragma once

#include "RecordingPlatform.h"

#include <string>

namespace qelo::test {

inline constexpr const char* administrationPath = "/admin";

// The root of user administration.
StoreNode administrationNode();

// An account below it with nothing but a name and AccountState 1.
StoreNode accountNode(const std::string& name);

// An account below it without any property.
StoreNode bareAccountNode();

// An account below it with every property; each value differs from all others.
StoreNode fullAccountNode(const std::string& name);

} // namespace qelo::test
