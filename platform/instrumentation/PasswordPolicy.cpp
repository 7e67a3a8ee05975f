#include "PasswordPolicy.h"

#include <algorithm>
#include <array>
#include <limits>

namespace qelo::nodes {

namespace {

constexpr std::array<std::string_view, 10> known = {"deny",      "remember", "minlen",  "usercheck",
                                                    "maxrepeat", "lcredit",  "ucredit", "dcredit",
                                                    "ocredit",   "minclass"};

constexpr std::int64_t allClasses = 4;

bool isKnown(std::string_view name) {
    return std::find(known.begin(), known.end(), name) != known.end();
}

} // namespace

bool PolicyReader::isReadable(const Setting& setting) {
    return !isKnown(setting.name) || wholeNumber(setting.value).has_value();
}

void PolicyReader::keep(const std::vector<Setting>& settings, Numbers& numbers) {
    for (const Setting& setting : settings) {
        const auto number = wholeNumber(setting.value);
        if (number && isKnown(setting.name)) {
            numbers[setting.name] = *number;
        } else if (setting.name == "reject_username") { // the older module's name for it
            numbers["usercheck"] = 1;
        }
    }
}

std::int64_t PolicyReader::valueOf(const Numbers& numbers, const char* name) {
    const auto found = numbers.find(name);
    return found == numbers.end() ? 0 : found->second;
}

std::optional<unsigned int> PolicyReader::countOf(const Numbers& numbers, const char* name) {
    const auto found = numbers.find(name);
    if (found == numbers.end() || found->second < 0 ||
        found->second > std::numeric_limits<unsigned int>::max()) {
        return std::nullopt;
    }
    return static_cast<unsigned int>(found->second);
}

void PolicyReader::readFaillock(const std::vector<Setting>& settings) { keep(settings, faillock_); }

void PolicyReader::readHistory(const std::vector<Setting>& settings) { keep(settings, history_); }

void PolicyReader::readQuality(const std::vector<Setting>& settings) { keep(settings, quality_); }

void PolicyReader::readModules(const std::vector<PasswordModule>& modules) {
    for (const PasswordModule& module : modules) {
        if (module.name == "pam_pwhistory.so") {
            keep(module.arguments, history_);
        } else if (module.name == "pam_pwquality.so" || module.name == "pam_cracklib.so") {
            keep(module.arguments, quality_);
        } else if (module.name == "pam_unix.so") {
            keep(module.arguments, unix_);
        }
    }
}

std::vector<unsigned int> PolicyReader::rules() const {
    const bool classes = valueOf(quality_, "minclass") >= allClasses;
    const auto positive = [this](const char* name) { return valueOf(quality_, name) > 0; };
    // A negative credit is the number of such characters that a password must have.
    const auto required = [&](const char* name) { return classes || valueOf(quality_, name) < 0; };
    const std::array<std::pair<PasswordRule, bool>, 7> enforced = {{
        {MinimumLength, positive("minlen") || valueOf(unix_, "minlen") > 0},
        {PrecludeUserId, valueOf(quality_, "usercheck") != 0},
        {MaximumRepeating, positive("maxrepeat")},
        {LowerCase, required("lcredit")},
        {UpperCase, required("ucredit")},
        {Numeric, required("dcredit")},
        {Special, required("ocredit")},
    }};
    std::vector<unsigned int> rules;
    for (const auto& [rule, isEnforced] : enforced) {
        if (isEnforced) {
            rules.push_back(rule);
        }
    }
    return rules;
}

PasswordPolicy PolicyReader::policy() const {
    PasswordPolicy policy;
    policy.maxLoginFailures = countOf(faillock_, "deny");
    policy.historyDepth = countOf(history_, "remember");
    if (!policy.historyDepth) {
        policy.historyDepth = countOf(unix_, "remember");
    }
    policy.rules = rules();
    return policy;
}

} // namespace qelo::nodes
