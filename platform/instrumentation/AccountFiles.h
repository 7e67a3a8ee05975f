// The account database's files as records: passwd, shadow and group.
//
// What a name means is what the system's own look-ups make of it: the first record of a name
// counts. Entries of network databases ("+" and "-"), records without a name and
// numbers that no account can have are left out. All this is reported as damage.
#pragma once

#include "Damage.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace qelo::nodes {

// What a password field says about logging in by password.
enum class PasswordUse {
    elsewhere, // the shadow file tells
    possible,  // a hash, or none needed
    locked,    // no password can match
};

// As the system's own "passwd -S" judges: a field that starts with "!" (locked, "!!" and
// "!*" included) or with "*" (an account without password login) is locked, an empty one is
// not, and "x" points to the shadow file.
PasswordUse passwordUse(std::string_view field);

struct AccountRecord {
    std::string name; // the bytes of the file
    std::uint32_t user = 0;
    std::uint32_t group = 0;
    PasswordUse password = PasswordUse::elsewhere;
    std::string fullName;
    std::string home;
    std::string shell;
};

// Days; negative when the file tells none.
struct ShadowRecord {
    PasswordUse password = PasswordUse::possible;
    long lastChange = -1; // since 1970
    long minimum = -1;
    long maximum = -1;
    long warning = -1;
    long inactive = -1;
    long expiry = -1; // since 1970
};

struct GroupRecord {
    std::string name; // the bytes of the file
    std::uint32_t number = 0;
    std::vector<std::string> members;
};

// Each takes the content of a file. The shadow records are keyed by account name; no
// password or hash is kept.
std::vector<AccountRecord> readAccounts(std::string& passwd, Damage& damage);
std::unordered_map<std::string, ShadowRecord> readShadow(std::string& shadow, Damage& damage);
std::vector<GroupRecord> readGroups(std::string& group, Damage& damage);

} // namespace qelo::nodes
