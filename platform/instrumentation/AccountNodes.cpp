#include "AccountNodes.h"

#include "Text.h"

#include <NodeLexicon.h>

#include <array>
#include <ctime>
#include <limits>

namespace qelo::nodes {

namespace {

using namespace Tesk::NodeLexicon;

constexpr unsigned int stateUsable = 1;
constexpr unsigned int stateExpired = 12;
constexpr unsigned int stateLocked = 16;

constexpr long secondsPerDay = 86'400;
constexpr long lastDay = 2'932'896; // 9999-12-31

const std::string& administrationPath() {
    static const std::string path = "/UserAdministration/1";
    return path;
}

// An empty field tells nothing, so it is no property.
void addText(Properties& properties, int id, const std::string& bytes) {
    if (!bytes.empty()) {
        properties.add(id, validUtf8(bytes));
    }
}

void addDays(Properties& properties, int id, long days) {
    if (days >= 0 && days <= std::numeric_limits<unsigned int>::max()) {
        properties.add(id, static_cast<unsigned int>(days));
    }
}

template <class T> void addIfTold(Properties& properties, int id, const std::optional<T>& value) {
    if (value) {
        properties.add(id, *value);
    }
}

void addShadow(Properties& properties, const ShadowRecord& shadow) {
    // Day 0 is no date there: it asks for a new password at the next log-in.
    if (shadow.lastChange > 0) {
        addIfTold(properties, PasswordLastChanged, dayText(shadow.lastChange));
    }
    addDays(properties, PasswordDaysMustKeep, shadow.minimum);
    addDays(properties, DaysMustChangePasswordAfter, shadow.maximum);
    addDays(properties, PasswordDaysWarnBeforeExpire, shadow.warning);
    addDays(properties, DaysExpireAfter, shadow.inactive);
    addIfTold(properties, PasswordExpiration, dayText(shadow.expiry));
}

} // namespace

Node administrationNode() { return {administrationPath(), {}}; }

Node serviceRootNode() { return {"/AccountServiceRoot/1", {}}; }

std::shared_ptr<const Properties> policyProperties(const PasswordPolicy& policy) {
    Properties properties;
    addIfTold(properties, MaxLoginFailures, policy.maxLoginFailures);
    addIfTold(properties, PasswordHistoryDepth, policy.historyDepth);
    if (!policy.rules.empty()) {
        properties.add(PasswordRules, policy.rules);
    }
    properties.seal();
    return std::make_shared<const Properties>(std::move(properties));
}

Node accountNode(const AccountRecord& account, const ShadowRecord* shadow, long today,
                 std::shared_ptr<const Properties> policy) {
    Properties properties;
    addText(properties, Name, account.name);
    addText(properties, UserID, std::to_string(account.user));
    addText(properties, GroupId, std::to_string(account.group));
    addText(properties, FullName, account.fullName);
    addText(properties, HomeDirectory, account.home);
    addText(properties, ScriptPath, account.shell);
    addIfTold(properties, AccountState, accountState(account.password, shadow, today));
    if (shadow) {
        addShadow(properties, *shadow);
    }
    properties.seal();
    return {administrationPath() + "/UserAccount/" + pathStep(account.name), std::move(properties),
            std::move(policy)};
}

Node groupNode(const GroupRecord& group) {
    Properties properties;
    addText(properties, Name, group.name);
    properties.add(GroupMembers, group.members);
    addText(properties, GroupId, std::to_string(group.number));
    properties.seal();
    return {administrationPath() + "/UserGroup/" + pathStep(group.name), std::move(properties)};
}

std::optional<unsigned int> accountState(PasswordUse password, const ShadowRecord* shadow,
                                         long today) {
    if (password == PasswordUse::elsewhere && shadow) {
        password = shadow->password;
    }
    if (password == PasswordUse::locked) {
        return stateLocked;
    }
    if (shadow && shadow->expiry >= 0 && shadow->expiry <= today) {
        return stateExpired;
    }
    if (password == PasswordUse::elsewhere) {
        return std::nullopt;
    }
    return stateUsable;
}

std::optional<std::string> dayText(long day) {
    if (day < 0 || day > lastDay) {
        return std::nullopt;
    }
    const std::time_t seconds = day * secondsPerDay;
    std::tm parts{};
    std::array<char, sizeof "YYYY-MM-DD HH:MM:SS"> text{};
    if (!::gmtime_r(&seconds, &parts) ||
        std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S", &parts) == 0) {
        return std::nullopt;
    }
    return std::string(text.data());
}

} // namespace qelo::nodes
