// The account database that damage is done to: accounts and groups "first", "victim" and "last".
#pragma once

#include <map>
#include <string>
#include <utility>
#include <vector>

namespace qelo::test {

// By their path below etc.
using Files = std::map<std::string, std::string>;
using Fields = std::vector<std::string>;

inline constexpr const char* kFaillock = "security/faillock.conf";
inline constexpr const char* kPwhistory = "security/pwhistory.conf";
inline constexpr const char* kPwquality = "security/pwquality.conf";
inline constexpr const char* kCommonPassword = "pam.d/common-password";

// The victim's line in each account file.
const std::map<std::string, Fields>& victims();
// The lines of "first" and of "last", which stand before and behind it.
const std::map<std::string, std::pair<std::string, std::string>>& frames();
// The files that tell the rules for passwords.
const Files& policyFiles();

std::string joined(const Fields& fields);

// All files, with that text where the victim's line of one of them is.
Files filesWith(const std::string& file, const std::string& between);
Files undamagedFiles();

// What has become of the line of "first" or "last" in a file.
enum class LineState {
    Whole,   // there byte by byte, and no other line has its name
    Missing, // no line has its name
    Unclear
};
LineState stateOfLine(const Files& files, const std::string& file, const std::string& name);

} // namespace qelo::test
