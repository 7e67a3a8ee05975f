#include "EntrySnapshot.h"

#include <algorithm>

namespace qelo::store {

namespace {

using FileOrder = std::array<const char*, kAccountFiles.size()>;

// An account appears last in passwd and disappears from it first.
constexpr FileOrder kOrderOfAppearing{kShadow, kSubuid, kSubgid, kGshadow, kGroup, kPasswd};
constexpr FileOrder kOrderOfDisappearing{kPasswd, kGroup, kGshadow, kSubgid, kSubuid, kShadow};

bool isGroupFile(const std::string& file) { return file == kGroup || file == kGshadow; }

// Fields of a line in which names of members stand.
std::vector<std::size_t> memberFields(const std::string& file) {
    return file == kGroup ? std::vector<std::size_t>{3} : std::vector<std::size_t>{2, 3};
}

struct Placed {
    std::size_t index;
    std::string line;
};

std::vector<Placed> linesOf(const Lines& lines, const std::string& key) {
    std::vector<Placed> found;
    for (std::size_t i = 0; i < lines.size(); ++i) {
        if (keyOf(lines[i]) == key) {
            found.push_back({i, lines[i]});
        }
    }
    return found;
}

bool sameLines(const std::vector<Placed>& one, const std::vector<Placed>& other) {
    return std::equal(one.begin(), one.end(), other.begin(), other.end(),
                      [](const Placed& a, const Placed& b) { return a.line == b.line; });
}

// Gives `key` the lines it had, at the places they had.
bool putBackLines(const Lines& before, const std::string& key, Lines& now) {
    const std::vector<Placed> wanted = linesOf(before, key);
    if (sameLines(wanted, linesOf(now, key))) {
        return false;
    }
    now.erase(std::remove_if(now.begin(), now.end(),
                             [&](const std::string& line) { return keyOf(line) == key; }),
              now.end());
    for (const Placed& placed : wanted) {
        const std::size_t index = std::min(placed.index, now.size());
        now.insert(now.begin() + static_cast<std::ptrdiff_t>(index), placed.line);
    }
    return true;
}

// The same for a group, whose line stays as it is when there was one and is one: only its
// members can differ, and these are looked at one by one.
bool putBackGroup(const Lines& before, const std::string& key, Lines& now) {
    return linesOf(before, key).empty() != linesOf(now, key).empty() &&
           putBackLines(before, key, now);
}

// Puts `member` into a list of names, or takes it out, as it was in the list `before`.
bool putBackMember(const std::string& before, const std::string& member, std::string& list) {
    const Fields old = splitFields(before, ',');
    Fields names = list.empty() ? Fields{} : splitFields(list, ',');
    const auto was = std::find(old.begin(), old.end(), member);
    const auto is = std::find(names.begin(), names.end(), member);
    if ((was == old.end()) == (is == names.end())) {
        return false;
    }
    if (is != names.end()) {
        names.erase(is);
    } else {
        const std::ptrdiff_t place = std::min(was - old.begin(), names.end() - names.begin());
        names.insert(names.begin() + place, member);
    }
    list = joinFields(names, ',');
    return true;
}

bool putBackMembership(const std::string& before, const std::string& member,
                       const std::vector<std::size_t>& places, std::string& line) {
    const Fields old = splitFields(before, ':');
    Fields fields = splitFields(line, ':');
    bool changed = false;
    for (const std::size_t place : places) {
        if (place < old.size() && place < fields.size()) {
            changed = putBackMember(old[place], member, fields[place]) || changed;
        }
    }
    if (changed) {
        line = joinFields(fields, ':');
    }
    return changed;
}

bool putBackMemberships(const Lines& before, const std::string& member,
                        const std::vector<std::size_t>& places, Lines& now) {
    bool changed = false;
    for (std::string& line : now) {
        const auto old = std::find_if(before.begin(), before.end(), [&](const std::string& other) {
            return keyOf(other) == keyOf(line);
        });
        if (old != before.end()) {
            changed = putBackMembership(*old, member, places, line) || changed;
        }
    }
    return changed;
}

} // namespace

Attempt<EntrySnapshot> EntrySnapshot::take(const RootDirectory& root, FileSystem& files,
                                           std::string account, std::string group) {
    EntrySnapshot snapshot(root, files);
    snapshot.account_ = std::move(account);
    snapshot.group_ = std::move(group);
    for (std::size_t i = 0; i < kAccountFiles.size(); ++i) {
        Attempt<Lines> lines = readLines(root, files, kAccountFiles[i]);
        if (!lines) {
            return lines.refusal();
        }
        snapshot.before_[i] = std::move(*lines);
    }
    return snapshot;
}

const Lines& EntrySnapshot::before(const std::string& file) const {
    const auto found = std::find(kAccountFiles.begin(), kAccountFiles.end(), file);
    return before_.at(static_cast<std::size_t>(found - kAccountFiles.begin()));
}

bool EntrySnapshot::putBack(const std::string& file, Lines& now) const {
    if (!isGroupFile(file)) {
        return !account_.empty() && putBackLines(before(file), account_, now);
    }
    bool changed = !group_.empty() && putBackGroup(before(file), group_, now);
    if (!account_.empty()) {
        changed = putBackMemberships(before(file), account_, memberFields(file), now) || changed;
    }
    return changed;
}

// Looks without a lock first: mostly nothing differs, and then nothing is to be written.
Problem EntrySnapshot::restoreFile(const char* name) const {
    Attempt<Lines> lines = readLines(*root_, *files_, name);
    if (lines && !putBack(name, *lines)) {
        return {};
    }
    return editLines(*root_, *files_, name, [&](Lines& now) { return putBack(name, now); });
}

Problem EntrySnapshot::restore() const {
    const bool appears = !linesOf(before(kPasswd), account_).empty();
    Problem first;
    for (const char* name : appears ? kOrderOfAppearing : kOrderOfDisappearing) {
        Problem problem = restoreFile(name);
        if (!first) {
            first = problem;
        }
    }
    return first;
}

} // namespace qelo::store
