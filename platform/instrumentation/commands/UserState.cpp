#include "UserCommands.h"

#include "AccountTools.h"
#include "EntrySnapshot.h"
#include "FieldRules.h"
#include "Rollback.h"

#include <functional>

namespace qelo::store {

namespace {

// What stands behind the lock. Empty, or locked again, when there is no password.
std::string unlockedHash(const Account& account) { return account.hash().substr(1); }

// Runs one change of the password field; `isDone` looks at the account afterwards. What the
// change may have done is put back when it failed.
Problem changeLock(const Workplace& workplace, const std::string& name,
                   const std::function<Problem(const AccountTools&)>& step,
                   const std::function<bool(const Account&)>& isDone) {
    const Attempt<EntrySnapshot> before =
        EntrySnapshot::take(workplace.root, workplace.files, name, {});
    if (!before) {
        return before.reason();
    }
    Rollback rollback(workplace);
    rollback.add([&] { return before->restore(); });
    if (Problem problem = step(AccountTools(workplace))) {
        return rollback.undo(*problem).reason;
    }
    const Attempt<Account> account = readAccount(workplace.root, workplace.files, name);
    if (!account || !isDone(*account)) {
        return rollback.undo("the account did not become what was asked for").reason;
    }
    rollback.dismiss();
    return {};
}

Problem enable(const Workplace& workplace, const Account& account) {
    if (account.hash().empty()) {
        return "the account has no password; set one first";
    }
    if (!account.isLocked()) {
        return {};
    }
    const std::string hash = unlockedHash(account);
    if (hash.empty() || hash.front() == '!') {
        return "the account has no password; set one first";
    }
    return changeLock(
        workplace, account.name,
        [&](const AccountTools& tools) { return tools.unlockAccount(account.name); },
        [&](const Account& now) { return now.hash() == hash; });
}

// An account without a password can be disabled as well: it is then one that nobody can use
// until it is given a password.
Problem disable(const Workplace& workplace, const Account& account) {
    if (account.uid == 0) {
        return "the superuser cannot be disabled";
    }
    if (account.isLocked()) {
        return {};
    }
    return changeLock(
        workplace, account.name,
        [&](const AccountTools& tools) { return tools.lockAccount(account.name); },
        [](const Account& now) { return now.isLocked(); });
}

} // namespace

Attempt<std::string> enableUser(const Workplace& workplace, const CommandRequest& request) {
    const Attempt<Account> account = readAccount(workplace.root, workplace.files, request.name);
    if (!account) {
        return account.refusal();
    }
    if (Problem problem = enable(workplace, *account)) {
        return Refusal{*problem};
    }
    return "User " + printable(request.name) + " is enabled.";
}

Attempt<std::string> disableUser(const Workplace& workplace, const CommandRequest& request) {
    const Attempt<Account> account = readAccount(workplace.root, workplace.files, request.name);
    if (!account) {
        return account.refusal();
    }
    if (Problem problem = disable(workplace, *account)) {
        return Refusal{*problem};
    }
    return "User " + printable(request.name) + " is disabled.";
}

} // namespace qelo::store
