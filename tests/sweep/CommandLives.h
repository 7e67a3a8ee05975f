// Accounts and groups that live and die by methods, many at once. Each thread has its own and
// knows what it has to find of them; in between it asks for everything else.
#pragma once

#include "ConcurrentRun.h"
#include "MixedOperations.h"

#include <string>
#include <vector>

namespace qelo::test {

class CommandLives {
public:
    // On a store that holds the accounts and groups of a new scratch root, and stands still.
    CommandLives(broker::Router& router, Findings& findings);

    // One life after the other until the run ends. The thread then leaves nothing behind.
    void live(std::size_t thread, const ConcurrentRun& run, Tally& tally) const;

    // That every kind of operation has been at work.
    void expectAllKinds(const Tally& tally) const;

private:
    friend class CommandLife;

    broker::Router& router_;
    Findings& findings_;
    std::vector<Operation> operations_;
    std::vector<Answer> atFirst_;
};

} // namespace qelo::test
