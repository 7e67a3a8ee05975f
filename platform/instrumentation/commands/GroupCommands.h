// The commands on groups. Each is one step; what it may have done to one of the two group
// files before it failed is put back.
#pragma once

#include "CommandRequest.h"
#include "Workplace.h"

#include <string>

namespace qelo::store {

// Each carries out one request of its method, under the store's lock, and returns the status
// text.
Attempt<std::string> createGroup(const Workplace& workplace, const CommandRequest& request);
Attempt<std::string> deleteGroup(const Workplace& workplace, const CommandRequest& request);
Attempt<std::string> addMember(const Workplace& workplace, const CommandRequest& request);
Attempt<std::string> removeMember(const Workplace& workplace, const CommandRequest& request);

} // namespace qelo::store
