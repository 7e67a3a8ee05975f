// A scratch root for one method of the providers, as it is before the method and after it.
#pragma once

#include "platform/commands/CommandTest.h"

#include <filesystem>
#include <map>
#include <ostream>
#include <string>
#include <vector>

namespace qelo::test {

struct SweptMethod {
    std::string name; // of the case
    std::string method;
    std::vector<std::string> before;    // commands of the store that prepare the root
    std::vector<std::string> arguments; // NAME:TYPE:VALUE, as text(), number(), dateTime() make
};

inline void PrintTo(const SweptMethod& method, std::ostream* stream) { *stream << method.name; }

// The ten methods, some in several ways.
std::vector<SweptMethod> sweptMethods();

class MethodWorld {
public:
    using State = std::map<std::string, std::string>;

    explicit MethodWorld(const SweptMethod& method);

    // The root as it was before the method.
    void renew();

    const std::filesystem::path& root() const { return root_; }
    const State& before() const { return before_; }
    const State& after() const { return after_; }
    // Everything below the root but the backups of tools; hashes are random, so only their
    // presence counts.
    State state() const;
    // Without a home directory that has been set aside, and what is left in it.
    static State withoutRests(State state);
    // Whether another command could begin at once.
    bool isUnlocked() const;

private:
    ScratchDirectory scratch_;
    std::filesystem::path root_ = scratch_.path() / "root";
    std::filesystem::path pristine_ = scratch_.path() / "pristine";
    State before_;
    State after_;
};

} // namespace qelo::test
