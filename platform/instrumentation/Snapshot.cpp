#include "Snapshot.h"

#include <stdexcept>

namespace qelo::nodes {

const std::vector<Node>& Snapshot::nodes(int type) const {
    static const std::vector<Node> none;
    if (failure_) {
        throw std::runtime_error(*failure_);
    }
    if (const auto failed = failures_.find(type); failed != failures_.end()) {
        throw std::runtime_error(failed->second);
    }
    const auto found = nodes_.find(type);
    return found == nodes_.end() ? none : found->second;
}

} // namespace qelo::nodes
