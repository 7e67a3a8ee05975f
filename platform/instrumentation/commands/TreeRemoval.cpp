#include "Tree.h"

#include <cerrno>
#include <fcntl.h>
#include <vector>

namespace qelo::store {

namespace {

// Each level costs a descriptor. What lies deeper is first moved up.
constexpr int kDeepest = 100;
// How often the top is gone through, for what was moved up and for what somebody else puts
// there at the same time.
constexpr int kMostPasses = 100000;
constexpr int kMostNames = 1000;

class Removal {
public:
    Removal(FileSystem& files, bool& removed) : files_(files), removed_(removed) {}

    bool tree(int parent, const std::string& name) {
        Descriptor top = files_.open(parent, name, O_RDONLY | O_DIRECTORY);
        if (!top) {
            return false;
        }
        mount_ = files_.mountOf(top.get());
        top_ = top.get();
        for (int pass = 0; pass < kMostPasses; ++pass) {
            if (!content(top.get(), 0)) {
                return false;
            }
            if (files_.removeDirectory(parent, name)) {
                removed_ = true;
                return true;
            }
            if (errno != ENOTEMPTY && errno != EEXIST) {
                return false;
            }
        }
        return false;
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
        struct stat status {};
        if (!files_.statusAt(parent, name, status)) {
            return errno == ENOENT;
        }
        if (!S_ISDIR(status.st_mode)) {
            return noteRemoved(files_.removeFile(parent, name));
        }
        return depth < kDeepest ? directory(parent, name, depth) : moveUp(parent, name);
    }

    bool directory(int parent, const std::string& name, int depth) {
        {
            const Descriptor directory = files_.open(parent, name, O_RDONLY | O_DIRECTORY);
            if (!directory || files_.mountOf(directory.get()) != mount_ ||
                !content(directory.get(), depth + 1)) {
                return false;
            }
        }
        return noteRemoved(files_.removeDirectory(parent, name));
    }

    // To the top, which is gone through again until it is empty.
    bool moveUp(int parent, const std::string& name) {
        for (int tries = 0; tries < kMostNames; ++tries) {
            if (files_.rename(parent, name, top_, ".deep-" + std::to_string(++moved_))) {
                return true;
            }
            if (errno != ENOTEMPTY && errno != EEXIST && errno != ENOTDIR) {
                return false;
            }
        }
        return false;
    }

    bool noteRemoved(bool done) {
        removed_ = removed_ || done;
        return done || errno == ENOENT;
    }

    FileSystem& files_;
    bool& removed_;
    std::uint64_t mount_ = 0;
    int top_ = -1;
    int moved_ = 0;
};

} // namespace

Problem removeTree(FileSystem& files, int parent, const std::string& name, bool& removed) {
    removed = false;
    return Removal(files, removed).tree(parent, name) ? Problem()
                                                      : Problem("not everything can be removed");
}

} // namespace qelo::store
