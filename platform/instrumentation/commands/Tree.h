// Whole directory trees: copied, given to another owner, removed.
//
// All work on open directories and never follow a symbolic link, so that whoever owns the
// tree, and may change it at the same time, cannot lead them out of it.
#pragma once

#include "Attempt.h"
#include "FileSystem.h"

#include <set>
#include <string>
#include <utility>

namespace qelo::store {

struct Owner {
    uid_t user;
    gid_t group;
};

// Copies what is below the directory `from` into the directory `to`: plain files, directories
// and symbolic links, with their permission bits, all given to `owner`. Other kinds of files
// are left out. At most 32 levels deep.
Problem copyTree(FileSystem& files, int from, int to, Owner owner);

// Files by device and number, apart by what of their ownership is meant.
struct OwnedFiles {
    std::set<std::pair<dev_t, ino_t>> ofUser;
    std::set<std::pair<dev_t, ino_t>> ofGroup;
};

// Adds to `owned` what in and below the directory `name` belongs to `owner` already, user and
// group each on its own. Limits as below.
Problem findOwned(FileSystem& files, int parent, const std::string& name, Owner owner,
                  OwnedFiles& owned);

// Gives what belongs to `from` in and below the directory `name` to `to`, user and group each
// on its own, but for the files of `except`. At most 200 levels deep, and not beyond mount
// points.
Problem changeTreeOwner(FileSystem& files, int parent, const std::string& name, Owner from,
                        Owner to, const OwnedFiles& except);

// Removes the directory `name` and everything below it, however deep, but not beyond mount
// points. `removed` tells afterwards whether anything at all was removed.
Problem removeTree(FileSystem& files, int parent, const std::string& name, bool& removed);

} // namespace qelo::store
