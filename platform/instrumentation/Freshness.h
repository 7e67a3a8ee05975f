// Whether a snapshot still tells what is on disk.
#pragma once

#include "Snapshot.h"

namespace qelo::nodes {

// True when every file is in the state in which it was read.
bool filesUnchanged(const Snapshot& snapshot, Files& files);

// True when the snapshot can be served as it is: no file changed, none was so fresh when it
// was read that a later change could carry the same time stamp, no read failed for a passing
// reason, and the date is the one that the values were computed for.
bool isCurrent(const Snapshot& snapshot, Files& files);

// Days since 1970 in UTC.
std::int64_t dayOf(std::int64_t nanoseconds);

} // namespace qelo::nodes
