#include "AccountDatabase.h"

#include "AccountFileNames.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <limits>

namespace qelo::store {

namespace {

constexpr std::size_t kPasswdFields = 7;
constexpr std::size_t kShadowFields = 9;
constexpr std::size_t kGroupFields = 4;

// The system's own mark for "no such number".
constexpr std::uint32_t kNoId = std::numeric_limits<std::uint32_t>::max();

constexpr std::string_view kBlanks = " \t\r\v\f";

// The name of a line as the system's look-ups see it: they pass over blanks before it.
std::string_view nameIn(std::string_view line) {
    const std::size_t start = line.find_first_not_of(kBlanks);
    return start == std::string_view::npos ? std::string_view() : keyOf(line.substr(start));
}

// Whether a line is one of `key` for the tools or for the system's look-ups.
bool isLineOf(std::string_view line, std::string_view key) {
    return keyOf(line) == key || nameIn(line) == key;
}

// Whether the two read a line of `key` alike.
bool isClear(const std::string& line, std::string_view key) {
    return keyOf(line) == key && line.find('\0') == std::string::npos;
}

bool hasKey(const Lines& lines, const std::string& key) {
    return std::any_of(lines.begin(), lines.end(),
                       [&](const std::string& line) { return isLineOf(line, key); });
}

std::optional<std::uint32_t> parseId(const std::string& text) {
    std::uint32_t id = 0;
    const auto end = text.data() + text.size();
    const auto read = std::from_chars(text.data(), end, id);
    const bool whole = read.ec == std::errc() && read.ptr == end && id != kNoId;
    return whole ? std::optional(id) : std::nullopt;
}

// Whether some line has the number `id` in its third field. A number that the C library would
// read differently than we do is not worth a risk, so leading zeros and the like are read too.
bool hasId(const Lines& lines, std::uint32_t id) {
    return std::any_of(lines.begin(), lines.end(), [&](const std::string& line) {
        const Fields fields = splitFields(line, ':');
        return fields.size() > 2 && parseId(fields[2]) == id;
    });
}

// Comments, and the entries that bring in or leave out accounts of a network name service.
// No tool changes these.
bool isNoEntry(const std::string& key) { return key.find_first_of("+-#") == 0; }

// The fields of the only line of `key`, of which there must be `count`.
Attempt<Fields> onlyLine(const Lines& lines, const std::string& key, std::size_t count,
                         const std::string& what) {
    Attempt<Fields> found = Refusal{"there is no such " + what};
    if (isNoEntry(key)) {
        return found;
    }
    bool clear = true;
    for (const std::string& line : lines) {
        if (!isLineOf(line, key)) {
            continue;
        }
        if (found) {
            return Refusal{"the " + what + " is there twice"};
        }
        found = splitFields(line, ':');
        clear = isClear(line, key);
    }
    if (found && (!clear || found->size() != count)) {
        return Refusal{"the " + what + " is malformed"};
    }
    return found;
}

} // namespace

bool Group::hasMember(const std::string& member) const {
    return std::find(members.begin(), members.end(), member) != members.end();
}

Attempt<AccountDatabase> AccountDatabase::read(const RootDirectory& root, FileSystem& files) {
    AccountDatabase database;
    const std::array<std::pair<const char*, Lines*>, 3> tables{
        {{kPasswd, &database.passwd_}, {kShadow, &database.shadow_}, {kGroup, &database.group_}}};
    for (const auto& [name, lines] : tables) {
        Attempt<Lines> read = readLines(root, files, name);
        if (!read) {
            return read.refusal();
        }
        *lines = std::move(*read);
    }
    return database;
}

bool AccountDatabase::hasAccountName(const std::string& name) const {
    return hasKey(passwd_, name) || hasKey(shadow_, name);
}

bool AccountDatabase::hasGroupName(const std::string& name) const { return hasKey(group_, name); }

bool AccountDatabase::hasUid(std::uint32_t uid) const { return hasId(passwd_, uid); }

bool AccountDatabase::hasGid(std::uint32_t gid) const { return hasId(group_, gid); }

Attempt<Account> AccountDatabase::account(const std::string& name) const {
    const Attempt<Fields> fields = onlyLine(passwd_, name, kPasswdFields, "account");
    if (!fields) {
        return fields.refusal();
    }
    const Attempt<Fields> shadow = onlyLine(shadow_, name, kShadowFields, "shadow entry");
    if (!shadow) {
        return shadow.refusal();
    }
    const std::optional<std::uint32_t> uid = parseId((*fields)[2]);
    const std::optional<std::uint32_t> gid = parseId((*fields)[3]);
    if (!uid || !gid) {
        return Refusal{"the account has no proper numbers"};
    }
    return Account{name, *uid, *gid, (*fields)[4], (*fields)[5], (*fields)[6], *shadow};
}

Attempt<Group> AccountDatabase::group(const std::string& name) const {
    const Attempt<Fields> fields = onlyLine(group_, name, kGroupFields, "group");
    if (!fields) {
        return fields.refusal();
    }
    const std::optional<std::uint32_t> gid = parseId((*fields)[2]);
    if (!gid) {
        return Refusal{"the group has no proper number"};
    }
    Group group{name, *gid, {}};
    if (!(*fields)[3].empty()) {
        group.members = splitFields((*fields)[3], ',');
    }
    return group;
}

std::vector<std::string> AccountDatabase::otherHomes(const std::string& name) const {
    std::vector<std::string> homes;
    for (const std::string& line : passwd_) {
        const Fields fields = splitFields(line, ':');
        if (fields.size() == kPasswdFields && fields[0] != name) {
            homes.push_back(fields[5]);
        }
    }
    return homes;
}

Attempt<Account> readAccount(const RootDirectory& root, FileSystem& files,
                             const std::string& name) {
    const Attempt<AccountDatabase> database = AccountDatabase::read(root, files);
    return database ? database->account(name) : Attempt<Account>(database.refusal());
}

} // namespace qelo::store
