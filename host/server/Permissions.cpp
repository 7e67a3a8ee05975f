#include "Permissions.h"

#include <algorithm>
#include <cerrno>
#include <grp.h>
#include <optional>
#include <pwd.h>
#include <sys/types.h>
#include <vector>

namespace qelo::server {
namespace {

constexpr std::size_t kLargestEntry = 16UL * 1024 * 1024; // a group may have very many members

// Calls one of the C library's getXXnam_r functions with a buffer that is large enough.
template <class Entry, class Function>
bool lookUp(const std::string& name, Entry& entry, std::vector<char>& buffer, Function function) {
    Entry* found = nullptr;
    for (buffer.resize(4096); buffer.size() <= kLargestEntry; buffer.resize(buffer.size() * 2)) {
        if (function(name.c_str(), &entry, buffer.data(), buffer.size(), &found) != ERANGE) {
            return found != nullptr;
        }
    }
    return false;
}

std::optional<gid_t> groupId(const std::string& name) {
    group entry = {};
    std::vector<char> buffer;
    return lookUp(name, entry, buffer, getgrnam_r) ? std::make_optional(entry.gr_gid)
                                                   : std::nullopt;
}

bool isMember(const std::string& user, gid_t id) {
    passwd entry = {};
    std::vector<char> buffer;
    if (!lookUp(user, entry, buffer, getpwnam_r)) {
        return false;
    }
    std::vector<gid_t> groups(64);
    int count = static_cast<int>(groups.size());
    while (getgrouplist(user.c_str(), entry.pw_gid, groups.data(), &count) < 0) {
        if (count <= static_cast<int>(groups.size())) {
            return false;
        }
        groups.resize(static_cast<std::size_t>(count));
    }
    groups.resize(static_cast<std::size_t>(count));
    return std::find(groups.begin(), groups.end(), id) != groups.end();
}

} // namespace

bool Permissions::mayChange(const std::string& user) const {
    if (user == "root") {
        return true;
    }
    if (user.empty() || group_.empty()) {
        return false;
    }
    const auto id = groupId(group_);
    return id && isMember(user, *id);
}

} // namespace qelo::server
