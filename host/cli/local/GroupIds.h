// Group ids of the node store in this process. The class of groups has no property for them.
#pragma once

#include <map>
#include <string>

namespace qelo::cli {

// The id of each group that has one, by the group's name; of groups with the same name the
// first counts. Throws what the store throws.
std::map<std::string, std::string> localGroupIds();

} // namespace qelo::cli
