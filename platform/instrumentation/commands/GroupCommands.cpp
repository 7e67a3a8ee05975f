#include "GroupCommands.h"

#include "AccountTools.h"
#include "EntrySnapshot.h"
#include "FieldRules.h"
#include "Rollback.h"

#include <functional>

namespace qelo::store {

namespace {

// One step on the groups: the entries it may change, the step, and whether its result is
// there.
struct GroupStep {
    std::string account;
    std::string group;
    std::function<Problem(const AccountTools&)> run;
    std::function<bool(const AccountDatabase&)> isDone;
};

Problem carryOut(const Workplace& workplace, const GroupStep& step) {
    const Attempt<EntrySnapshot> before =
        EntrySnapshot::take(workplace.root, workplace.files, step.account, step.group);
    if (!before) {
        return before.reason();
    }
    Rollback rollback(workplace);
    rollback.add([&] { return before->restore(); });
    if (Problem problem = step.run(AccountTools(workplace))) {
        return rollback.undo(*problem).reason;
    }
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database || !step.isDone(*database)) {
        return rollback.undo("the group did not become what was asked for").reason;
    }
    rollback.dismiss();
    return {};
}

Attempt<std::string> statusAfter(const Problem& problem, const std::string& status) {
    return problem ? Attempt<std::string>(Refusal{*problem}) : Attempt<std::string>(status);
}

bool isMember(const AccountDatabase& database, const std::string& group,
              const std::string& member) {
    const Attempt<Group> entry = database.group(group);
    return entry && entry->hasMember(member);
}

} // namespace

Attempt<std::string> createGroup(const Workplace& workplace, const CommandRequest& request) {
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.refusal();
    }
    if (database->hasGroupName(request.name)) {
        return Refusal{"the group exists"};
    }
    if (request.gid && (*request.gid == 0 || database->hasGid(*request.gid))) {
        return Refusal{"GroupId is in use"};
    }
    const auto isDone = [&](const AccountDatabase& now) {
        const Attempt<Group> group = now.group(request.name);
        return group && (!request.gid || group->gid == *request.gid);
    };
    const Problem problem = carryOut(
        workplace,
        {{},
         request.name,
         [&](const AccountTools& tools) { return tools.addGroup(request.name, request.gid); },
         isDone});
    return statusAfter(problem, "Group " + request.name + " was created.");
}

Attempt<std::string> deleteGroup(const Workplace& workplace, const CommandRequest& request) {
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.refusal();
    }
    const Attempt<Group> group = database->group(request.name);
    if (!group) {
        return group.refusal();
    }
    if (group->gid == 0) {
        return Refusal{"the superuser's group cannot be deleted"};
    }
    const Problem problem = carryOut(
        workplace, {{},
                    request.name,
                    [&](const AccountTools& tools) { return tools.deleteGroup(request.name); },
                    [&](const AccountDatabase& now) { return !now.hasGroupName(request.name); }});
    return statusAfter(problem, "Group " + printable(request.name) + " was deleted.");
}

Attempt<std::string> addMember(const Workplace& workplace, const CommandRequest& request) {
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.refusal();
    }
    const std::string& member = *request.member;
    const Attempt<Group> group = database->group(request.name);
    const Attempt<Account> account = database->account(member);
    if (!group || !account) {
        return group ? account.refusal() : group.refusal();
    }
    std::string status =
        "User " + printable(member) + " is a member of group " + printable(request.name) + ".";
    if (group->hasMember(member)) {
        return status;
    }
    const Problem problem =
        carryOut(workplace,
                 {member,
                  {},
                  [&](const AccountTools& tools) { return tools.addMember(request.name, member); },
                  [&](const AccountDatabase& now) { return isMember(now, request.name, member); }});
    return statusAfter(problem, status);
}

Attempt<std::string> removeMember(const Workplace& workplace, const CommandRequest& request) {
    const Attempt<AccountDatabase> database =
        AccountDatabase::read(workplace.root, workplace.files);
    if (!database) {
        return database.refusal();
    }
    const std::string& member = *request.member;
    const Attempt<Group> group = database->group(request.name);
    if (!group) {
        return group.refusal();
    }
    if (!group->hasMember(member)) {
        return Refusal{"the group has no such member"};
    }
    const bool isAccount = static_cast<bool>(database->account(member));
    const Problem problem = carryOut(
        workplace,
        {member,
         {},
         [&](const AccountTools& tools) {
             return tools.removeMember(request.name, member, isAccount);
         },
         [&](const AccountDatabase& now) { return !isMember(now, request.name, member); }});
    return statusAfter(problem, "User " + printable(member) + " is no member of group " +
                                    printable(request.name) + " any more.");
}

} // namespace qelo::store
