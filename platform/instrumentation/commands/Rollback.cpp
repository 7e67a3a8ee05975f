#include "Rollback.h"

namespace qelo::store {

Rollback::~Rollback() {
    // A step that throws is gone from the list, so this ends.
    while (!steps_.empty()) {
        try {
            undo("");
        } catch (...) {
            continue;
        }
    }
}

void Rollback::dismiss() noexcept {
    steps_.clear();
    if (done_ != nullptr) {
        *done_ = true;
    }
}

Refusal Rollback::undo(const std::string& why) {
    std::string reason = why;
    while (!steps_.empty()) {
        const std::function<Problem()> step = std::move(steps_.back());
        steps_.pop_back();
        if (const Problem problem = step()) {
            reason += "; not undone: " + *problem;
        }
    }
    return Refusal{reason};
}

} // namespace qelo::store
