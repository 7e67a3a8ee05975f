// What account tools, and this store, leave behind in the directory of the account files when one
// of their own system calls fails, or when they are killed.
#pragma once

#include "FileSystem.h"
#include "RootDirectory.h"

namespace qelo::store {

// Removes locks of processes that are gone, and new versions of account files ("shadow+") that
// nobody is writing. What cannot be removed stays: it harms nobody. The store's own lock has
// to be held.
void removeToolRests(const RootDirectory& root, FileSystem& files);

} // namespace qelo::store
