#include "UserCommands.h"

#include "AccountTools.h"
#include "EntrySnapshot.h"
#include "FieldRules.h"
#include "HomeCreation.h"
#include "Rollback.h"

#include <cerrno>

namespace qelo::store {

namespace {

Owner ownerOf(const Account& account) { return {account.uid, account.gid}; }

// The superuser can be given another name, home or password, but nothing that takes the
// account away or shuts it out.
Problem checkSuperuser(const Account& account, const CommandRequest& request) {
    const bool renumbers = request.uid || request.gid;
    const bool shutsOut =
        request.shell || request.ageing.maximum || request.ageing.inactive || request.ageing.expiry;
    if (account.uid == 0 && (renumbers || shutsOut)) {
        return "the superuser's numbers, shell and expiry cannot be changed";
    }
    return {};
}

Problem checkConflicts(const AccountDatabase& database, const Account& account,
                       const CommandRequest& request) {
    if (Problem problem = checkSuperuser(account, request)) {
        return problem;
    }
    if (request.uid && *request.uid != account.uid &&
        (*request.uid == 0 || database.hasUid(*request.uid))) {
        return "UserID is in use";
    }
    if (request.gid && !database.hasGid(*request.gid)) {
        return "there is no group with this GroupId";
    }
    return {};
}

// The comment column with another first field; the others (room, telephone) stay.
std::string commentWith(const std::string& comment, const std::string& fullName) {
    const std::size_t end = comment.find(',');
    return end == std::string::npos ? fullName : fullName + comment.substr(end);
}

template <typename T> void applyTo(T& field, const std::optional<T>& value) {
    field = value.value_or(field);
}

template <typename T> void applyTo(std::string& field, const std::optional<T>& value) {
    if (value) {
        field = std::to_string(*value);
    }
}

// A password set behind a lock stays behind it: only EnableUser enables. An account that never
// had one is locked for lack of it, and its first password opens it.
Secret hashFor(const Account& account, const Secret& hash) {
    const bool disabled = account.isLocked() && account.hash().size() > 1;
    return Secret({disabled ? "!" : "", hash.view()});
}

// The account's line in passwd as it is to be after the command.
Account wantedAccount(const Account& account, const CommandRequest& request) {
    Account wanted = account;
    wanted.uid = request.uid.value_or(account.uid);
    wanted.gid = request.gid.value_or(account.gid);
    wanted.home = request.home.value_or(account.home);
    wanted.shell = request.shell.value_or(account.shell);
    if (request.fullName) {
        wanted.comment = commentWith(account.comment, *request.fullName);
    }
    return wanted;
}

bool isSameLine(const Account& one, const Account& other) {
    return one.uid == other.uid && one.gid == other.gid && one.comment == other.comment &&
           one.home == other.home && one.shell == other.shell;
}

template <typename T> bool isAsAsked(const std::optional<T>& asked, const std::string& is) {
    return !asked || std::to_string(*asked) == is;
}

bool isShadowAsAsked(const Account& account, const Ageing& ageing, const Secret* hash) {
    const Fields& fields = account.shadow;
    return isAsAsked(ageing.minimum, fields[3]) && isAsAsked(ageing.maximum, fields[4]) &&
           isAsAsked(ageing.warning, fields[5]) && isAsAsked(ageing.inactive, fields[6]) &&
           isAsAsked(ageing.expiry, fields[7]) &&
           (hash == nullptr || account.hash() == hash->view());
}

template <typename T> std::optional<T> changed(const T& from, const T& to) {
    return from == to ? std::nullopt : std::optional<T>(to);
}

class Modification {
public:
    Modification(const Workplace& workplace, const CommandRequest& request, const Account& before,
                 const Secret* hash)
        : workplace_(workplace), request_(request), before_(before),
          wanted_(wantedAccount(before, request)), hash_(hash), home_(workplace) {}

    Problem run() {
        const AccountTools tools(workplace_);
        if (Problem problem = lookAtHome()) {
            return problem;
        }
        if (Problem problem = tools.changeAccount(before_, accountChange())) {
            return problem;
        }
        if (Problem problem = changeOwner(ownerOf(before_), ownerOf(wanted_), {})) {
            return problem;
        }
        if (Problem problem = makeHome()) {
            return problem;
        }
        if (Problem problem = tools.changeShadow(before_.name, request_.ageing, hash_)) {
            return problem;
        }
        return checkResult();
    }

    // Gives files back that were given to the new numbers, by the tool or by us.
    Problem undo() {
        const Problem problem = home_.undo();
        const Problem owner = changeOwner(ownerOf(wanted_), ownerOf(before_), ownedBefore_);
        return problem ? problem : owner;
    }

private:
    AccountChange accountChange() const {
        return {changed(before_.comment, wanted_.comment), changed(before_.home, wanted_.home),
                changed(before_.shell, wanted_.shell), changed(before_.uid, wanted_.uid),
                changed(before_.gid, wanted_.gid)};
    }

    Problem makeHome() {
        if (!request_.createHome.value_or(false)) {
            return {};
        }
        const Attempt<RootSettings> settings = readRootSettings(workplace_);
        return settings ? home_.make(wanted_.home, ownerOf(wanted_), *settings)
                        : Problem(settings.reason());
    }

    // Finds the home directory that the account has after the change, if it is the account's
    // and the change gives its files to other numbers; as usermod does.
    Problem findHome() {
        const Owner from = ownerOf(before_);
        const Owner to = ownerOf(wanted_);
        if (from.user == to.user && from.group == to.group) {
            return {};
        }
        Attempt<Place> place = findInRoot(workplace_, wanted_.home);
        if (!place) {
            return "the home directory: " + place.reason();
        }
        struct stat status {};
        if (!place->hasParent() ||
            !workplace_.files.statusAt(place->parent.get(), place->name, status)) {
            return !place->hasParent() || errno == ENOENT
                       ? Problem()
                       : Problem("the home directory cannot be looked at");
        }
        if (S_ISDIR(status.st_mode) && status.st_uid == before_.uid) {
            ownHome_ = std::move(*place);
        }
        return {};
    }

    // What belongs to the new numbers before the change must do so after it was undone.
    Problem lookAtHome() {
        if (Problem problem = findHome()) {
            return problem;
        }
        return ownHome_ ? findOwned(workplace_.files, ownHome_->parent.get(), ownHome_->name,
                                    ownerOf(wanted_), ownedBefore_)
                        : Problem();
    }

    // On the machine's own root usermod has given the files away before, and nothing is left
    // to do.
    Problem changeOwner(Owner from, Owner to, const OwnedFiles& except) {
        return ownHome_ ? changeTreeOwner(workplace_.files, ownHome_->parent.get(), ownHome_->name,
                                          from, to, except)
                        : Problem();
    }

    // Whether the tools did what they said.
    Problem checkResult() const {
        const Attempt<Account> account =
            readAccount(workplace_.root, workplace_.files, before_.name);
        if (!account) {
            return account.reason();
        }
        return isSameLine(*account, wanted_) && isShadowAsAsked(*account, request_.ageing, hash_)
                   ? Problem()
                   : Problem("the account did not become what was asked for");
    }

    const Workplace& workplace_;
    const CommandRequest& request_;
    const Account& before_;
    const Account wanted_;
    const Secret* hash_;
    NewHome home_;
    std::optional<Place> ownHome_;
    OwnedFiles ownedBefore_;
};

// Makes the change, and puts everything back when it fails.
Problem change(const Workplace& workplace, const CommandRequest& request, const Account& account,
               const Secret* hash) {
    const Attempt<EntrySnapshot> before =
        EntrySnapshot::take(workplace.root, workplace.files, request.name, {});
    if (!before) {
        return before.reason();
    }
    Modification modification(workplace, request, account, hash);
    Rollback rollback(workplace);
    rollback.add([&] { return before->restore(); });
    rollback.add([&] { return modification.undo(); });
    if (Problem problem = modification.run()) {
        return rollback.undo(*problem).reason;
    }
    rollback.dismiss();
    return {};
}

// Changes the account and returns it as it was before.
Attempt<Account> changeUser(const Workplace& workplace, const CommandRequest& request,
                            const Secret* newHash) {
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.refusal();
    }
    Attempt<Account> account = database->account(request.name);
    if (!account) {
        return account;
    }
    if (Problem problem = checkConflicts(*database, *account, request)) {
        return Refusal{*problem};
    }
    std::optional<Secret> hash;
    if (newHash != nullptr) {
        hash = hashFor(*account, *newHash);
    }
    if (Problem problem = change(workplace, request, *account, hash ? &*hash : nullptr)) {
        return Refusal{*problem};
    }
    return account;
}

} // namespace

Attempt<std::string> modifyUser(const Workplace& workplace, const CommandRequest& request,
                                const Secret* hash) {
    const Attempt<Account> account = changeUser(workplace, request, hash);
    if (!account) {
        return account.refusal();
    }
    return "User " + printable(request.name) + " was changed.";
}

Attempt<std::string> setPassword(const Workplace& workplace, const CommandRequest& request,
                                 const Secret& hash) {
    const Attempt<Account> account = changeUser(workplace, request, &hash);
    if (!account) {
        return account.refusal();
    }
    const bool disabled = account->isLocked() && account->hash().size() > 1;
    return "The password of user " + printable(request.name) +
           (disabled ? " was changed. The user stays disabled." : " was changed.");
}

} // namespace qelo::store
