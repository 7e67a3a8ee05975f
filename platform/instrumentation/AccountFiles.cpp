#include "AccountFiles.h"

#include "RecordReader.h"
#include "Text.h"

#include <grp.h>
#include <limits>
#include <pwd.h>
#include <shadow.h>
#include <unordered_set>

namespace qelo::nodes {

namespace {

constexpr std::size_t passwdFields = 7;
constexpr std::size_t shadowFields = 9;
constexpr std::size_t groupFields = 4;

// The system's own mark for "no such number".
constexpr std::uint32_t noId = std::numeric_limits<std::uint32_t>::max();

using Names = std::unordered_set<std::string>;

std::string_view field(const char* text) {
    return text ? std::string_view(text) : std::string_view();
}

// Whether the name is one of a local record; reports it when not.
bool isLocalName(std::string_view name, RecordLines& lines) {
    const bool network = !name.empty() && (name.front() == '+' || name.front() == '-');
    if (name.empty()) {
        lines.report("no name");
    } else if (network) {
        lines.report("entry of a network database");
    }
    return !name.empty() && !network;
}

// Passes on whether a name was new; reports it when not.
bool firstOfName(bool isNew, RecordLines& lines) {
    if (!isNew) {
        lines.report("name used before");
    }
    return isNew;
}

bool isNewName(const char* text, Names& known, RecordLines& lines) {
    const std::string_view name = field(text);
    return isLocalName(name, lines) && firstOfName(known.emplace(name).second, lines);
}

std::string_view firstOf(std::string_view gecos) { return gecos.substr(0, gecos.find(',')); }

AccountRecord accountOf(const passwd& entry, RecordLines& lines) {
    AccountRecord account;
    account.name = field(entry.pw_name);
    account.user = entry.pw_uid;
    account.group = entry.pw_gid;
    account.password = passwordUse(field(entry.pw_passwd));
    account.fullName = firstOf(field(entry.pw_gecos));
    account.home = field(entry.pw_dir);
    account.shell = field(entry.pw_shell);
    if (!isValidUtf8(account.name) || !isValidUtf8(account.fullName) ||
        !isValidUtf8(account.home) || !isValidUtf8(account.shell)) {
        lines.report("not valid UTF-8");
    }
    return account;
}

ShadowRecord shadowOf(const spwd& entry) {
    ShadowRecord record;
    const bool locked = passwordUse(field(entry.sp_pwdp)) == PasswordUse::locked;
    record.password = locked ? PasswordUse::locked : PasswordUse::possible;
    record.lastChange = entry.sp_lstchg;
    record.minimum = entry.sp_min;
    record.maximum = entry.sp_max;
    record.warning = entry.sp_warn;
    record.inactive = entry.sp_inact;
    record.expiry = entry.sp_expire;
    return record;
}

GroupRecord groupOf(const struct group& entry, RecordLines& lines) {
    GroupRecord record;
    record.name = field(entry.gr_name);
    record.number = entry.gr_gid;
    bool valid = isValidUtf8(record.name);
    for (char** member = entry.gr_mem; member && *member; ++member) {
        record.members.emplace_back(validUtf8(*member));
        valid = valid && isValidUtf8(*member);
    }
    if (!valid) {
        lines.report("not valid UTF-8");
    }
    return record;
}

} // namespace

PasswordUse passwordUse(std::string_view field) {
    if (field == "x") {
        return PasswordUse::elsewhere;
    }
    const bool locked = !field.empty() && (field.front() == '!' || field.front() == '*');
    return locked ? PasswordUse::locked : PasswordUse::possible;
}

std::vector<AccountRecord> readAccounts(std::string& passwd, Damage& damage) {
    std::vector<AccountRecord> accounts;
    Names known;
    RecordLines lines(passwd, passwdFields, damage);
    readRecords<struct passwd>(passwd, lines, ::fgetpwent_r, [&](const struct passwd& entry) {
        if (entry.pw_uid == noId || entry.pw_gid == noId) {
            lines.report("number out of range");
        } else if (isNewName(entry.pw_name, known, lines)) {
            accounts.push_back(accountOf(entry, lines));
        }
    });
    return accounts;
}

std::unordered_map<std::string, ShadowRecord> readShadow(std::string& shadow, Damage& damage) {
    std::unordered_map<std::string, ShadowRecord> records;
    RecordLines lines(shadow, shadowFields, damage);
    readRecords<spwd>(shadow, lines, ::fgetspent_r, [&](const spwd& entry) {
        if (isLocalName(field(entry.sp_namp), lines)) {
            firstOfName(records.emplace(entry.sp_namp, shadowOf(entry)).second, lines);
        }
    });
    return records;
}

std::vector<GroupRecord> readGroups(std::string& group, Damage& damage) {
    std::vector<GroupRecord> groups;
    Names known;
    RecordLines lines(group, groupFields, damage);
    readRecords<struct group>(group, lines, ::fgetgrent_r, [&](const struct group& entry) {
        if (entry.gr_gid == noId) {
            lines.report("number out of range");
        } else if (isNewName(entry.gr_name, known, lines)) {
            groups.push_back(groupOf(entry, lines));
        }
    });
    return groups;
}

} // namespace qelo::nodes
