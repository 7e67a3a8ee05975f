// The system's settings for passwords and log-ins, as far as its files state them. What no
// file sets stays unset, also where a module has a default of its own.
#pragma once

#include "ConfigText.h"

#include <map>
#include <optional>
#include <string_view>
#include <vector>

namespace qelo::nodes {

// The store's numbers of password rules.
enum PasswordRule : unsigned int {
    MinimumLength = 1,
    PrecludeUserId = 2,
    MaximumRepeating = 3,
    LowerCase = 4,
    UpperCase = 5,
    Numeric = 6,
    Special = 7,
};

struct PasswordPolicy {
    std::optional<unsigned int> maxLoginFailures;
    std::optional<unsigned int> historyDepth;
    std::vector<unsigned int> rules; // ascending
};

// Takes the settings in the order in which they override each other and gives the policy.
// A value that is not a number is passed over; the caller asks isReadable to report it.
class PolicyReader {
public:
    // faillock.conf, pwhistory.conf, pwquality.conf
    void readFaillock(const std::vector<Setting>& settings);
    void readHistory(const std::vector<Setting>& settings);
    void readQuality(const std::vector<Setting>& settings);

    // The stack for password changes. Its arguments go before the files above.
    void readModules(const std::vector<PasswordModule>& modules);

    PasswordPolicy policy() const;

    // False when the setting is one that the policy needs, with a value that is no number.
    static bool isReadable(const Setting& setting);

private:
    using Numbers = std::map<std::string, std::int64_t>;
    static void keep(const std::vector<Setting>& settings, Numbers& numbers);
    static std::int64_t valueOf(const Numbers& numbers, const char* name);
    static std::optional<unsigned int> countOf(const Numbers& numbers, const char* name);
    std::vector<unsigned int> rules() const;

    Numbers faillock_;
    Numbers history_;
    Numbers quality_;
    Numbers unix_;
};

} // namespace qelo::nodes
