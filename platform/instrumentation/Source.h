// Where the nodes come from: the account database, or a node file.
#pragma once

#include "Snapshot.h"

#include <memory>
#include <string>

namespace qelo::nodes {

// For any thread.
class Source {
public:
    Source() = default;
    virtual ~Source() = default;
    Source(const Source&) = delete;
    Source& operator=(const Source&) = delete;

    // Reads everything. What cannot be read is a failure within the snapshot; only a lack
    // of memory is thrown.
    virtual std::shared_ptr<const Snapshot> take() = 0;

    // Carries out an administration command. True when it was done; then `status` is its
    // status text. Otherwise nothing was changed.
    virtual bool execute(const std::string& command, std::string& status);
};

} // namespace qelo::nodes
