// Paths of the account database, such as home directories, looked up below the root
// directory that the database belongs to, and nowhere else.
#pragma once

#include "Attempt.h"
#include "Workplace.h"

#include <string>
#include <vector>

namespace qelo::store {

// A directory entry: an open directory and a name in it. The name itself may stand for
// nothing, for a directory or for anything else; it has not been looked at.
struct Place {
    // Invalid when there is no such directory, or the path is the root itself.
    Descriptor parent;
    std::string name;
    // The path from the root, without symbolic links in all but its last part.
    std::string path;

    bool hasParent() const { return static_cast<bool>(parent); }
};

// Finds the entry that the absolute path `path` means below the root. Symbolic links on the
// way lead on within the root, as they would for a process whose root directory it is. One
// that belongs to neither the superuser nor this process's user is refused, because its owner
// could lead the superuser anywhere with it.
Attempt<Place> findInRoot(const Workplace& workplace, const std::string& path);

// Directories that were made on the way to a place; made by ensureParent.
struct MadeDirectory {
    Descriptor parent;
    std::string name;
};

// The same, but makes missing directories on the way (mode 0755) and appends them to `made`.
Attempt<Place> ensureParentInRoot(const Workplace& workplace, const std::string& path,
                                  std::vector<MadeDirectory>& made);

} // namespace qelo::store
