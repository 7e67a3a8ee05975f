// Making home directories.
//
// The tools could do it, but useradd takes the machine's skeleton instead of the root's and
// follows symbolic links out of the root, and what it leaves after a failure has to be found
// out. So there is this one way, on the machine's own root too.
#pragma once

#include "PathInRoot.h"
#include "RootSettings.h"
#include "Tree.h"

#include <optional>

namespace qelo::store {

class NewHome {
public:
    explicit NewHome(const Workplace& workplace) : workplace_(workplace) {}

    // Makes the directory with the skeleton's content, all belonging to `owner`. It appears
    // under its name only when it is complete. A directory that is there already and belongs
    // to the owner is left as it is; anything else of that name is a problem, and so is a
    // parent directory that others may write to. After a problem nothing is left.
    Problem make(const std::string& path, Owner owner, const RootSettings& settings);

    // Removes what make() made, directories on the way included.
    Problem undo();

private:
    Problem build(const Place& place, Owner owner, const RootSettings& settings);
    Problem fill(int directory, Owner owner, const RootSettings& settings);
    Problem copySkeleton(int directory, Owner owner, const std::string& skeleton);
    Problem isAcceptable(const Place& place, Owner owner, bool& exists);

    Workplace workplace_;
    std::vector<MadeDirectory> made_;
    std::optional<Place> home_;
};

} // namespace qelo::store
