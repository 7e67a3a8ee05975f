#include "UserCommands.h"

#include "AccountTools.h"
#include "EntrySnapshot.h"
#include "FieldRules.h"
#include "HomeCreation.h"
#include "NewMailFile.h"
#include "Rollback.h"

namespace qelo::store {

namespace {

Problem checkConflicts(const AccountDatabase& database, const CommandRequest& request) {
    if (database.hasAccountName(request.name)) {
        return "the account exists";
    }
    if (request.uid && (*request.uid == 0 || database.hasUid(*request.uid))) {
        return "UserID is in use";
    }
    if (request.gid && !database.hasGid(*request.gid)) {
        return "there is no group with this GroupId";
    }
    return {};
}

template <typename T, typename U> bool isAsAsked(const std::optional<T>& asked, const U& is) {
    return !asked || *asked == is;
}

// Whether the tools did what they said.
bool isAsRequested(const Account& account, const CommandRequest& request, const Secret* hash) {
    return account.uid != 0 && isAsAsked(request.uid, account.uid) &&
           isAsAsked(request.gid, account.gid) && isAsAsked(request.fullName, account.comment) &&
           isAsAsked(request.home, account.home) && isAsAsked(request.shell, account.shell) &&
           (hash == nullptr ? account.isLocked() : account.hash() == hash->view());
}

Problem checkResult(const Workplace& workplace, const CommandRequest& request, const Secret* hash) {
    const Attempt<Account> account = readAccount(workplace.root, workplace.files, request.name);
    if (!account) {
        return account.reason();
    }
    return isAsRequested(*account, request, hash)
               ? Problem()
               : Problem("the account did not become what was asked for");
}

Problem makeHome(const Workplace& workplace, const CommandRequest& request,
                 const RootSettings& settings, NewHome& home) {
    if (!request.createHome.value_or(settings.createHome)) {
        return {};
    }
    const Attempt<Account> account = readAccount(workplace.root, workplace.files, request.name);
    if (!account) {
        return account.reason();
    }
    return home.make(account->home, {account->uid, account->gid}, settings);
}

Problem create(const Workplace& workplace, const CommandRequest& request, const Secret* hash,
               const RootSettings& settings, NewHome& home) {
    const AccountTools tools(workplace);
    if (Problem problem = tools.addAccount({request.name, request.fullName, request.home,
                                            request.shell, request.uid, request.gid})) {
        return problem;
    }
    if (Problem problem = makeHome(workplace, request, settings, home)) {
        return problem;
    }
    if (hash != nullptr) {
        if (Problem problem = tools.changeShadow(request.name, {}, hash)) {
            return problem;
        }
    }
    return checkResult(workplace, request, hash);
}

} // namespace

Attempt<std::string> createUser(const Workplace& workplace, const CommandRequest& request,
                                const Secret* hash) {
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.refusal();
    }
    if (Problem problem = checkConflicts(*database, request)) {
        return Refusal{*problem};
    }
    const Attempt<EntrySnapshot> before =
        EntrySnapshot::take(workplace.root, workplace.files, request.name, request.name);
    if (!before) {
        return before.refusal();
    }
    const Attempt<RootSettings> settings = readRootSettings(workplace);
    if (!settings) {
        return settings.refusal();
    }
    NewMailFile mail(workplace, settings->mailDirectory, request.name);
    NewHome home(workplace);
    Rollback rollback(workplace);
    rollback.add([&] { return mail.undo(); });
    rollback.add([&] { return before->restore(); });
    rollback.add([&] { return home.undo(); });
    if (Problem problem = create(workplace, request, hash, *settings, home)) {
        return rollback.undo(*problem);
    }
    rollback.dismiss();
    return "User " + request.name + " was created.";
}

} // namespace qelo::store
