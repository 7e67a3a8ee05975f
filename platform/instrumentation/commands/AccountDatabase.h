// The account database as it stands, read to decide on a command and to check its outcome.
#pragma once

#include "AccountTable.h"

#include <cstdint>
#include <optional>
#include <string>

namespace qelo::store {

struct Account {
    std::string name;
    std::uint32_t uid = 0;
    std::uint32_t gid = 0;
    std::string comment;
    std::string home;
    std::string shell;
    // The fields of the shadow line. Never shown to anybody.
    Fields shadow;

    const std::string& hash() const { return shadow.at(1); }
    bool isLocked() const { return !hash().empty() && hash().front() == '!'; }
};

struct Group {
    std::string name;
    std::uint32_t gid = 0;
    std::vector<std::string> members;

    bool hasMember(const std::string& member) const;
};

class AccountDatabase {
public:
    static Attempt<AccountDatabase> read(const RootDirectory& root, FileSystem& files);

    bool hasAccountName(const std::string& name) const;
    bool hasGroupName(const std::string& name) const;
    bool hasUid(std::uint32_t uid) const;
    bool hasGid(std::uint32_t gid) const;

    // The account or group of a name. Refused when there is none, when the name has several
    // lines in a file, when its shadow line is missing, or when a line is malformed: then it
    // is not certain what a tool would change.
    Attempt<Account> account(const std::string& name) const;
    Attempt<Group> group(const std::string& name) const;

    // The home directories of all accounts but `name`.
    std::vector<std::string> otherHomes(const std::string& name) const;

private:
    Lines passwd_;
    Lines shadow_;
    Lines group_;
};

// The account of a name as it stands now.
Attempt<Account> readAccount(const RootDirectory& root, FileSystem& files, const std::string& name);

} // namespace qelo::store
