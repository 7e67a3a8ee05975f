// Administration commands of the built qelosim on a scratch root, with the library preloaded
// that makes system calls fail.
#pragma once

#include "preload/FaultPlan.h"

#include "platform/commands/CommandTest.h"

#include <filesystem>
#include <map>
#include <ostream>
#include <string>
#include <vector>

namespace qelo::test {

struct WatchedCommand {
    std::string name;
    std::vector<std::string> before;    // commands of the store that prepare the root
    std::vector<std::string> arguments; // of qelosim
    std::string input;
};

inline void PrintTo(const WatchedCommand& command, std::ostream* stream) {
    *stream << command.name;
}

struct WatchedRun {
    int status = 0;
    std::string said;   // on both outputs
    std::string failed; // which call of which program was made to fail; empty for none
    long calls = 0;
};

class WatchedWorld {
public:
    using State = std::map<std::string, std::string>;

    explicit WatchedWorld(const WatchedCommand& command);
    ~WatchedWorld();
    WatchedWorld(const WatchedWorld&) = delete;
    WatchedWorld& operator=(const WatchedWorld&) = delete;

    // Runs the command. The calls from number `first` to `last` fail with `error`, or end
    // their process for an error of 0; none for a first number of 0.
    WatchedRun run(long first, long last, int error);

    // The root as it was before the command.
    void renew();

    const std::filesystem::path& root() const { return root_; }
    const State& before() const { return before_; }
    const State& after() const { return after_; }
    // Everything below the root but the backups of tools; hashes are random, so only their
    // presence counts.
    State state() const;
    // Without a home directory that has been set aside, and what is in it.
    static State withoutRests(State state);

private:
    void makePlan();

    const WatchedCommand& command_;
    ScratchDirectory scratch_;
    std::filesystem::path root_ = scratch_.path() / "root";
    std::filesystem::path pristine_ = scratch_.path() / "pristine";
    std::filesystem::path plan_ = scratch_.path() / "plan";
    std::filesystem::path logConfig_ = scratch_.path() / "logging.conf";
    sweep::FaultPlan* shared_ = nullptr;
    State before_;
    State after_;
};

} // namespace qelo::test
