// Undoes the steps of a command unless the command comes to its end.
#pragma once

#include "Attempt.h"
#include "Workplace.h"

#include <functional>
#include <vector>

namespace qelo::store {

class Rollback {
public:
    explicit Rollback(const Workplace& workplace) : done_(workplace.done) {}
    // Undoes too: an exception (there is no memory left) must not leave half a change.
    ~Rollback();
    Rollback(const Rollback&) = delete;
    Rollback& operator=(const Rollback&) = delete;

    // `step` is to undo what comes next, however much of that is done by then.
    void add(std::function<Problem()> step) { steps_.push_back(std::move(step)); }

    // The command is done: nothing is to be undone, and the workplace notes it.
    void dismiss() noexcept;

    // Undoes everything, last step first, and gives the reason for the caller's refusal:
    // `why`, and what could not be undone.
    Refusal undo(const std::string& why);

private:
    std::vector<std::function<Problem()>> steps_;
    bool* done_;
};

} // namespace qelo::store
