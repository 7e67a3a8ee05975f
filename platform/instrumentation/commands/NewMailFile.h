// The mail file that useradd may make for a new account.
#pragma once

#include "PathInRoot.h"

#include <optional>
#include <string>

namespace qelo::store {

class NewMailFile {
public:
    // Looks whether there is a mail file of this name. To be made before useradd is run.
    NewMailFile(const Workplace& workplace, const std::string& mailDirectory,
                const std::string& name);

    // Removes the mail file if there was none before and it is still empty.
    Problem undo();

private:
    Workplace workplace_;
    // Where a new one would be; absent when there is one already or nobody can tell.
    std::optional<Place> place_;
};

} // namespace qelo::store
