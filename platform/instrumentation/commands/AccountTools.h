// The system's account tools (Debian's package passwd, version 4.13) on one root directory.
//
// For the machine's own root every change is made by a tool. Below another root the tools are
// given --prefix, where they have it and where it works; -R is never used, because it loads
// name-service modules from inside the root with the rights of this process. What was found,
// by trying each of them on a scratch root with its system calls traced:
//
//   useradd    reads PREFIX/etc/login.defs and PREFIX/etc/default/useradd, numbers come from
//              the prefix, subuid and subgid are kept. Without -l it looks at the machine's
//              lastlog and faillog, and -m copies the machine's /etc/skel instead of the
//              prefix's: so -l always, and home directories are made by HomeCreation.h.
//   usermod    comment, home, shell, -L, -U and -G work. -u writes to the machine's lastlog and
//              faillog and takes the mail file of another account whose name is this name cut
//              by one character; -g looks the group up in the machine's /etc/group. So numbers
//              below a prefix are changed in the passwd file.
//   userdel    takes the account out of all six files, with its private group. -r has the fault
//              of the mail file and is never used; home directories are removed by
//              HomeRemoval.h, on the machine's own root too.
//   groupadd, groupdel  work.
//   groupmod   -U forgets gshadow, so it is not used.
//   chpasswd, chage, gpasswd  have no --prefix. Members are changed by usermod -G, or, where
//              that cannot name them, in the files; password and ageing in the shadow file.
//
// An ordinary user who owns the root can run all of these.
#pragma once

#include "AccountDatabase.h"
#include "CommandRequest.h"
#include "Workplace.h"

#include <string>
#include <vector>

namespace qelo::store {

struct NewAccount {
    std::string name;
    std::optional<std::string> comment;
    std::optional<std::string> home;
    std::optional<std::string> shell;
    std::optional<std::uint32_t> uid;
    std::optional<std::uint32_t> gid;
};

// What is absent stays as it is.
struct AccountChange {
    std::optional<std::string> comment;
    std::optional<std::string> home;
    std::optional<std::string> shell;
    std::optional<std::uint32_t> uid;
    std::optional<std::uint32_t> gid;
};

// Each function makes one change. After a problem the change may have been made in part. None
// starts a process when there is nothing to change.
class AccountTools {
public:
    explicit AccountTools(const Workplace& workplace) : workplace_(workplace) {}

    // A locked account without a password and without a home directory.
    Problem addAccount(const NewAccount& account) const;
    Problem changeAccount(const Account& account, const AccountChange& change) const;
    Problem lockAccount(const std::string& name) const;
    Problem unlockAccount(const std::string& name) const;
    // Leaves the home directory.
    Problem deleteAccount(const std::string& name) const;
    // Ageing, and the password field when `hash` is given.
    Problem changeShadow(const std::string& name, const Ageing& ageing, const Secret* hash) const;

    Problem addGroup(const std::string& name, std::optional<std::uint32_t> gid) const;
    Problem deleteGroup(const std::string& name) const;
    Problem addMember(const std::string& group, const std::string& member) const;
    // `isAccount` tells whether the member is an account or only a name in the list.
    Problem removeMember(const std::string& group, const std::string& member, bool isAccount) const;

private:
    // Runs a tool: options, the prefix where one is needed, "--" and the name.
    Problem runOnName(const char* program, std::vector<std::string> options,
                      const std::string& name) const;
    // Runs it again while it only failed to get its locks.
    Problem run(const ToolCall& call) const;
    Problem changeWithChage(const std::string& name, const Ageing& ageing) const;
    Problem changeWithChpasswd(const std::string& name, const Secret& hash) const;
    Problem changeMembership(const std::string& group, const std::string& member,
                             const char* option) const;

    Workplace workplace_;
};

} // namespace qelo::store
