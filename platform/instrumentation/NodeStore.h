// A source of nodes with its current snapshot. For any thread: the one lock is held only
// while the pointer to the snapshot is read or set, never while files are read.
#pragma once

#include "Report.h"
#include "Source.h"

#include <memory>
#include <mutex>
#include <string>

namespace qelo::nodes {

class NodeStore {
public:
    NodeStore(std::unique_ptr<Source> source, Files& files);

    // The snapshot of what is on disk now. Files are read only when they changed.
    std::shared_ptr<const Snapshot> current();

    // Reads the source anew, whether or not its files seem to have changed.
    std::shared_ptr<const Snapshot> refresh();

    // Carries out a command; see Source. The next snapshot is taken after it.
    bool execute(const std::string& command, std::string& status);

private:
    std::shared_ptr<const Snapshot> take(std::uint64_t generation);
    std::uint64_t drop();

    std::unique_ptr<Source> source_;
    Files& files_;
    Reporter reporter_;

    std::mutex mutex_; // for the two members below
    std::shared_ptr<const Snapshot> snapshot_;
    // Counts what makes snapshots under way out of date, so that none is kept afterwards.
    std::uint64_t generation_ = 0;
};

} // namespace qelo::nodes
