#include "HomeRemoval.h"

#include "Tree.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <fcntl.h>

namespace qelo::store {

namespace {

constexpr std::array<const char*, 14> kSystemDirectories{"bin",   "boot",  "dev",    "etc",  "lib",
                                                         "lib32", "lib64", "libx32", "proc", "run",
                                                         "sbin",  "snap",  "sys",    "usr"};

constexpr int kMostNames = 1000;

// Directories directly below the root, or directly below /var, are nobody's own.
bool isSystemDirectory(const std::string& path) {
    const Fields parts = splitFields(std::string_view(path).substr(1), '/');
    const bool known = std::find(kSystemDirectories.begin(), kSystemDirectories.end(),
                                 parts.front()) != kSystemDirectories.end();
    return known || parts.size() < (parts.front() == "var" ? 3u : 2u);
}

bool isAtOrBelow(const std::string& path, const std::string& directory) {
    return path == directory || path.compare(0, directory.size() + 1, directory + "/") == 0;
}

bool isSameFile(const struct stat& one, const struct stat& other) {
    return one.st_dev == other.st_dev && one.st_ino == other.st_ino;
}

} // namespace

// The path of a directory without symbolic links, the last part included; as it is when it
// leads nowhere.
std::string OldHome::fullPath(const std::string& path) const {
    const std::string below = "/x";
    const Attempt<Place> place = findInRoot(workplace_, path + below);
    if (!place || !place->hasParent()) {
        return path;
    }
    return place->path.substr(0, place->path.size() - below.size());
}

Problem OldHome::checkEntry(const Place& place, const Account& account) {
    FileSystem& files = workplace_.files;
    if (!S_ISDIR(status_.st_mode) || status_.st_uid != account.uid) {
        return "the home directory does not belong to the account";
    }
    if (isSystemDirectory(place.path)) {
        return "the home directory is a directory of the system";
    }
    const Descriptor directory = files.open(place.parent.get(), place.name, O_PATH | O_DIRECTORY);
    if (!directory || files.mountOf(directory.get()) != files.mountOf(place.parent.get())) {
        return "the home directory is a mount point";
    }
    return {};
}

Problem OldHome::choose(const Account& account, const std::vector<std::string>& otherHomes) {
    if (account.home.empty() || account.home.front() != '/') {
        return {};
    }
    if (account.home.find_first_not_of("/.") == std::string::npos) {
        return "the home directory is a directory of the system";
    }
    Attempt<Place> place = findInRoot(workplace_, account.home);
    if (!place) {
        return "the home directory: " + place.reason();
    }
    if (!place->hasParent()) {
        return {};
    }
    if (!workplace_.files.statusAt(place->parent.get(), place->name, status_)) {
        return errno == ENOENT ? Problem() : Problem("the home directory cannot be looked at");
    }
    if (Problem problem = checkEntry(*place, account)) {
        return problem;
    }
    for (const std::string& other : otherHomes) {
        if (isAtOrBelow(fullPath(other), place->path)) {
            return "the home directory is another account's too";
        }
    }
    place_ = std::move(*place);
    return {};
}

Problem OldHome::setAside() {
    if (!place_) {
        return {};
    }
    FileSystem& files = workplace_.files;
    const int parent = place_->parent.get();
    struct stat found {};
    int number = 0;
    std::string name;
    do {
        name = ".qelosim-old-" + std::to_string(++number);
    } while (number < kMostNames && files.statusAt(parent, name, found));
    if (!files.rename(parent, place_->name, parent, name)) {
        return "the home directory cannot be renamed";
    }
    aside_ = std::move(name);
    // Whoever may write to the parent could have exchanged it since it was looked at.
    if (!files.statusAt(parent, aside_, found) || !isSameFile(found, status_)) {
        putBack();
        return "the home directory was exchanged meanwhile";
    }
    return {};
}

Problem OldHome::putBack() {
    if (aside_.empty()) {
        return {};
    }
    const int parent = place_->parent.get();
    if (!workplace_.files.rename(parent, aside_, parent, place_->name)) {
        return "the home directory stays at " + pathAside();
    }
    aside_.clear();
    return {};
}

Problem OldHome::destroy(bool& removed) {
    removed = false;
    return aside_.empty() ? Problem()
                          : removeTree(workplace_.files, place_->parent.get(), aside_, removed);
}

std::string OldHome::pathAside() const {
    return place_->path.substr(0, place_->path.size() - place_->name.size()) + aside_;
}

} // namespace qelo::store
