#include "NodeStore.h"

#include "Freshness.h"

namespace qelo::nodes {

NodeStore::NodeStore(std::unique_ptr<Source> source, Files& files)
    : source_(std::move(source)), files_(files) {}

std::shared_ptr<const Snapshot> NodeStore::take(std::uint64_t generation) {
    auto snapshot = source_->take();
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        if (generation == generation_) {
            snapshot_ = snapshot;
        }
    }
    reporter_.tell(*snapshot);
    return snapshot;
}

std::uint64_t NodeStore::drop() {
    const std::lock_guard<std::mutex> lock(mutex_);
    snapshot_.reset();
    return ++generation_;
}

std::shared_ptr<const Snapshot> NodeStore::current() {
    std::shared_ptr<const Snapshot> held;
    std::uint64_t generation = 0;
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        held = snapshot_;
        generation = generation_;
    }
    return held && isCurrent(*held, files_) ? held : take(generation);
}

std::shared_ptr<const Snapshot> NodeStore::refresh() { return take(drop()); }

bool NodeStore::execute(const std::string& command, std::string& status) {
    const bool done = source_->execute(command, status);
    if (done) {
        drop();
    }
    return done;
}

} // namespace qelo::nodes
