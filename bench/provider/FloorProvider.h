// A provider that serves ready instances: what an enumeration costs that reads no store and
// traces nothing, but makes the same calls of the broker for the same instances.
#pragma once

#include <cim/Instance.h>

#include <vector>

namespace qelo::bench {

// The instances that the class floorClass consists of from now on, with their string
// properties as texts and its keys those of the first instance's path.
void setFloorInstances(const std::vector<cim::Instance>& instances);

inline constexpr const char* floorClass = "FLOOR_Account";

} // namespace qelo::bench
