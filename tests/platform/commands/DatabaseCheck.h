// Checks that the account files below a root directory belong together.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace qelo::test {

// What is wrong with <root>/etc: malformed lines, an account without its one shadow line or a
// shadow line without account, a group likewise, names or numbers in use twice, a member list
// that names one member twice or differs from gshadow's, a subordinate range without account,
// lock files or drafts left behind, an account whose group is missing. Empty when all is well.
std::vector<std::string> findFaults(const std::filesystem::path& root);

} // namespace qelo::test
