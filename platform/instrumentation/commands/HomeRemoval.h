// Removing the home directory of an account that is deleted.
#pragma once

#include "AccountDatabase.h"
#include "PathInRoot.h"

#include <optional>

namespace qelo::store {

// In three steps, of which the first two can be taken back: choose, set aside, destroy.
class OldHome {
public:
    explicit OldHome(const Workplace& workplace) : workplace_(workplace) {}

    // Looks for the account's home directory. There being none is no problem. Refused is a
    // directory that
    //   does not belong to the account, or is a symbolic link or no directory,
    //   is a directory of the system, or too near to the root to be somebody's own,
    //   is, or holds, the home directory of another account (`otherHomes`),
    //   is a mount point.
    Problem choose(const Account& account, const std::vector<std::string>& otherHomes);

    // Renames it, so that it is no longer where a new account of the name would find it.
    Problem setAside();
    Problem putBack();
    // Removes it. `removed` tells after a problem whether anything is gone.
    Problem destroy(bool& removed);

    bool isChosen() const { return place_.has_value(); }
    // Where it is after setAside(), as a path from the root.
    std::string pathAside() const;

private:
    Problem checkEntry(const Place& place, const Account& account);
    std::string fullPath(const std::string& path) const;

    Workplace workplace_;
    std::optional<Place> place_;
    struct stat status_ {};
    std::string aside_;
};

} // namespace qelo::store
