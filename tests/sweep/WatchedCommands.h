// Administration commands of the built qelosim on a scratch root, with the library preloaded
// that makes system calls fail.
#pragma once

#include "HalfDone.h"
#include "preload/FaultPlan.h"

#include "platform/commands/CommandTest.h"

#include <filesystem>
#include <ostream>
#include <string>
#include <vector>

namespace qelo::test {

struct WatchedCommand {
    std::string name;
    std::vector<std::string> before;    // commands of the store that prepare the root
    std::vector<std::string> arguments; // of qelosim
    std::string input;
    bool makesRoot = false; // there is no root before it
};

inline void PrintTo(const WatchedCommand& command, std::ostream* stream) {
    *stream << command.name;
}

// What is to happen at a call.
struct Fault {
    sweep::FaultWay way;
    int error; // what the call leaves in errno, where it fails
};

struct WatchedRun {
    int status = 0;
    std::string said;   // on both outputs
    std::string failed; // which call of which program it happened to; empty for none
    long calls = 0;     // that it could have happened to
};

// Whether no sanitizer has found anything.
bool isSane(const WatchedRun& run);

class WatchedWorld {
public:
    explicit WatchedWorld(const WatchedCommand& command);
    ~WatchedWorld();
    WatchedWorld(const WatchedWorld&) = delete;
    WatchedWorld& operator=(const WatchedWorld&) = delete;

    // Runs the command with a fault at the call of this number, from 1; at none for 0.
    WatchedRun run(long number, Fault fault);

    // The root as it was before the command.
    void renew();
    const std::filesystem::path& root() const { return root_; }
    const RootState& before() const { return before_; }
    const RootState& after() const { return after_; }
    // Everything below the root but the backups of tools; hashes are random, so only their
    // presence counts. Empty where there is no root.
    RootState state() const;
    // Without a home directory that has been set aside, and what is in it.
    static RootState withoutRests(RootState state);

private:
    void makePlan();
    void prepareRoot();
    std::vector<std::string> commandLine() const;

    const WatchedCommand& command_;
    ScratchDirectory scratch_;
    std::filesystem::path root_ = scratch_.path() / "root";
    std::filesystem::path pristine_ = scratch_.path() / "pristine";
    std::filesystem::path plan_ = scratch_.path() / "plan";
    std::filesystem::path logConfig_ = scratch_.path() / "logging.conf";
    sweep::FaultPlan* shared_ = nullptr;
    RootState before_;
    RootState after_;
};

} // namespace qelo::test
