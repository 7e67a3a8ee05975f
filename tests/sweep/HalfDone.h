// What a command that was cut off may leave of the account files, and what not.
#pragma once

#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace qelo::test {

// A root directory by paths, as of stateOf.
using RootState = std::map<std::string, std::string>;

// What is wrong with the account files of `now`, which were those of `before` and would be those
// of `after` if the command had come to its end: a file that is missing or has another mode or
// owner, a line that is incomplete, a line of both states that is not there once, a name of both
// that is gone, a name that is there twice or that is of neither. Empty when all is well.
std::vector<std::string> findLosses(const RootState& now, const RootState& before,
                                    const RootState& after);

// Locks, drafts and whatever else is in <root>/etc and has no business there once all commands
// are done.
std::vector<std::string> findRests(const std::filesystem::path& root);

} // namespace qelo::test
