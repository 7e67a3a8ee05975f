#include "Tree.h"

#include <fcntl.h>
#include <functional>
#include <vector>

namespace qelo::store {

namespace {

// Each level costs a descriptor.
constexpr int kDeepest = 200;
constexpr auto kSame = static_cast<uid_t>(-1);

// Goes through a directory tree of one mount. Everything is looked at and changed through one
// descriptor, so that no other file can take its name in between.
class Walk {
public:
    // Called with the open file and what it is; false ends the walk.
    using Visit = std::function<bool(int, const struct stat&)>;

    Walk(FileSystem& files, Visit visit) : files_(files), visit_(std::move(visit)) {}

    bool directory(int parent, const std::string& name, int depth) {
        const Descriptor directory = files_.open(parent, name, O_RDONLY | O_DIRECTORY);
        struct stat status {};
        if (depth > kDeepest || !directory || !files_.status(directory.get(), status)) {
            return false;
        }
        const std::uint64_t mount = files_.mountOf(directory.get());
        if (depth == 0) {
            mount_ = mount;
        }
        return mount != mount_ ||
               (content(directory.get(), depth) && visit_(directory.get(), status));
    }

private:
    bool content(int directory, int depth) {
        std::vector<std::string> names;
        if (!files_.list(directory, names)) {
            return false;
        }
        for (const std::string& name : names) {
            if (!entry(directory, name, depth)) {
                return false;
            }
        }
        return true;
    }

    bool entry(int parent, const std::string& name, int depth) {
        const Descriptor file = files_.open(parent, name, O_PATH);
        struct stat status {};
        if (!file || !files_.status(file.get(), status)) {
            return false;
        }
        return S_ISDIR(status.st_mode) ? directory(parent, name, depth + 1)
                                       : visit_(file.get(), status);
    }

    FileSystem& files_;
    Visit visit_;
    std::uint64_t mount_ = 0;
};

std::pair<dev_t, ino_t> identityOf(const struct stat& status) {
    return {status.st_dev, status.st_ino};
}

bool giveTo(FileSystem& files, int file, const struct stat& status, Owner from, Owner to,
            const OwnedFiles& except) {
    const bool user = status.st_uid == from.user && from.user != to.user &&
                      except.ofUser.count(identityOf(status)) == 0;
    const bool group = status.st_gid == from.group && from.group != to.group &&
                       except.ofGroup.count(identityOf(status)) == 0;
    return (!user && !group) ||
           files.changeOwnerAt(file, "", user ? to.user : kSame, group ? to.group : kSame);
}

} // namespace

Problem findOwned(FileSystem& files, int parent, const std::string& name, Owner owner,
                  OwnedFiles& owned) {
    Walk walk(files, [&](int, const struct stat& status) {
        if (status.st_uid == owner.user) {
            owned.ofUser.insert(identityOf(status));
        }
        if (status.st_gid == owner.group) {
            owned.ofGroup.insert(identityOf(status));
        }
        return true;
    });
    return walk.directory(parent, name, 0) ? Problem()
                                           : Problem("the home directory cannot be read");
}

Problem changeTreeOwner(FileSystem& files, int parent, const std::string& name, Owner from,
                        Owner to, const OwnedFiles& except) {
    Walk walk(files, [&](int file, const struct stat& status) {
        return giveTo(files, file, status, from, to, except);
    });
    return walk.directory(parent, name, 0)
               ? Problem()
               : Problem("the home directory cannot be given to its owner's new numbers");
}

} // namespace qelo::store
