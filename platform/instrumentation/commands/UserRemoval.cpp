#include "UserCommands.h"

#include "AccountTools.h"
#include "EntrySnapshot.h"
#include "FieldRules.h"
#include "HomeRemoval.h"
#include "Rollback.h"

#include <new>

namespace qelo::store {

namespace {

Problem deleteAccount(const Workplace& workplace, const std::string& name) {
    if (Problem problem = AccountTools(workplace).deleteAccount(name)) {
        return problem;
    }
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.reason();
    }
    return database->hasAccountName(name) ? Problem("the account is still there") : Problem();
}

// A home directory of which something is gone cannot be put back, whatever stopped it.
Problem destroy(OldHome& home, bool& removed) {
    try {
        return home.destroy(removed);
    } catch (const std::bad_alloc&) {
        if (!removed) {
            throw;
        }
        return "no memory"; // so short that it needs none
    }
}

Attempt<std::string> remove(const Workplace& workplace, const std::string& name, OldHome& home) {
    const Attempt<EntrySnapshot> before =
        EntrySnapshot::take(workplace.root, workplace.files, name, name);
    if (!before) {
        return before.refusal();
    }
    Rollback rollback(workplace);
    rollback.add([&] { return before->restore(); });
    rollback.add([&] { return home.putBack(); });
    Problem problem = home.setAside();
    if (!problem) {
        problem = deleteAccount(workplace, name);
    }
    if (problem) {
        return rollback.undo(*problem);
    }
    bool removed = false;
    problem = destroy(home, removed);
    if (problem && !removed) {
        return rollback.undo("the home directory: " + *problem);
    }
    rollback.dismiss();
    return "User " + printable(name) + " was deleted." +
           (problem
                ? " A part of the home directory is left at " + printable(home.pathAside()) + "."
                : "");
}

} // namespace

Attempt<std::string> deleteUser(const Workplace& workplace, const CommandRequest& request) {
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.refusal();
    }
    const Attempt<Account> account = database->account(request.name);
    if (!account) {
        return account.refusal();
    }
    if (account->uid == 0) {
        return Refusal{"the superuser cannot be deleted"};
    }
    OldHome home(workplace);
    if (request.removeHome.value_or(false)) {
        if (Problem problem = home.choose(*account, database->otherHomes(request.name))) {
            return Refusal{*problem};
        }
    }
    return remove(workplace, request.name, home);
}

} // namespace qelo::store
