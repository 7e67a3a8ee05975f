#include "HomeCreation.h"

#include <cerrno>
#include <fcntl.h>
#include <new>
#include <unistd.h>

namespace qelo::store {

namespace {

// Whether only the superuser or this process's user can rename things in a directory.
bool isOwnDirectory(const struct stat& status) {
    const bool shared = (status.st_mode & (S_IWGRP | S_IWOTH)) != 0;
    return (status.st_uid == 0 || status.st_uid == ::geteuid()) &&
           (!shared || (status.st_mode & S_ISVTX) != 0);
}

// A directory in the making: it goes with its owner unless it has been given its name.
class Draft {
public:
    Draft(FileSystem& files, int parent)
        : files_(files), parent_(parent), name_(".qelosim-new-" + std::to_string(::getpid())) {}
    ~Draft() {
        if (made_) {
            try {
                bool removed = false;
                removeTree(files_, parent_, name_, removed);
            } catch (const std::bad_alloc&) {
                return; // it stays until the next of this number
            }
        }
    }
    Draft(const Draft&) = delete;
    Draft& operator=(const Draft&) = delete;

    // Nothing but a killed process of this number can have left one; it is not ours to keep.
    bool make() {
        bool removed = false;
        made_ = files_.makeDirectory(parent_, name_, 0700) ||
                (errno == EEXIST && !removeTree(files_, parent_, name_, removed) &&
                 files_.makeDirectory(parent_, name_, 0700));
        return made_;
    }
    Descriptor open() { return files_.open(parent_, name_, O_RDONLY | O_DIRECTORY); }
    bool giveName(const std::string& name) {
        made_ = !files_.rename(parent_, name_, parent_, name);
        return !made_;
    }

private:
    FileSystem& files_;
    int parent_;
    std::string name_;
    bool made_ = false;
};

} // namespace

Problem NewHome::isAcceptable(const Place& place, Owner owner, bool& exists) {
    struct stat parent {};
    struct stat status {};
    if (!workplace_.files.status(place.parent.get(), parent) || !isOwnDirectory(parent)) {
        return "the home directory's parent can be changed by other users";
    }
    exists = workplace_.files.statusAt(place.parent.get(), place.name, status);
    if (!exists) {
        return errno == ENOENT ? Problem() : Problem("the home directory cannot be looked at");
    }
    return S_ISDIR(status.st_mode) && status.st_uid == owner.user
               ? Problem()
               : Problem("the home directory exists and does not belong to the account");
}

Problem NewHome::copySkeleton(int directory, Owner owner, const std::string& skeleton) {
    const Attempt<Place> place = findInRoot(workplace_, skeleton);
    if (!place) {
        return "the skeleton of home directories: " + place.reason();
    }
    if (!place->hasParent()) {
        return {};
    }
    const Descriptor source =
        workplace_.files.open(place->parent.get(), place->name, O_RDONLY | O_DIRECTORY);
    if (!source) {
        return errno == ENOENT ? Problem() : Problem("the skeleton cannot be opened");
    }
    return copyTree(workplace_.files, source.get(), directory, owner);
}

Problem NewHome::fill(int directory, Owner owner, const RootSettings& settings) {
    if (Problem problem = copySkeleton(directory, owner, settings.skeleton)) {
        return problem;
    }
    FileSystem& files = workplace_.files;
    return files.changeOwner(directory, owner.user, owner.group) &&
                   files.changeMode(directory, settings.homeMode)
               ? Problem()
               : Problem("the home directory cannot be given to the account");
}

Problem NewHome::build(const Place& place, Owner owner, const RootSettings& settings) {
    Draft draft(workplace_.files, place.parent.get());
    if (!draft.make()) {
        return "the home directory cannot be made";
    }
    const Descriptor directory = draft.open();
    if (!directory) {
        return "the home directory cannot be opened";
    }
    if (Problem problem = fill(directory.get(), owner, settings)) {
        return problem;
    }
    return draft.giveName(place.name) ? Problem() : Problem("the home directory cannot be named");
}

Problem NewHome::make(const std::string& path, Owner owner, const RootSettings& settings) {
    bool exists = false;
    Attempt<Place> place = ensureParentInRoot(workplace_, path, made_);
    Problem problem = place ? isAcceptable(*place, owner, exists) : Problem(place.reason());
    if (!problem && !exists) {
        problem = build(*place, owner, settings);
        if (!problem) {
            home_ = std::move(*place);
        }
    }
    if (problem) {
        undo();
    }
    return problem;
}

Problem NewHome::undo() {
    Problem problem;
    bool removed = false;
    if (home_) {
        problem = removeTree(workplace_.files, home_->parent.get(), home_->name, removed);
        home_.reset();
    }
    while (!made_.empty()) {
        const MadeDirectory& last = made_.back();
        // Whoever has put something there in the meantime keeps the directory.
        workplace_.files.removeDirectory(last.parent.get(), last.name);
        made_.pop_back();
    }
    return problem;
}

} // namespace qelo::store
