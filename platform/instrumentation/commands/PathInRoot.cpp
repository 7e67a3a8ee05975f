#include "PathInRoot.h"

#include "AccountTable.h"

#include <cerrno>
#include <deque>
#include <fcntl.h>
#include <unistd.h>

namespace qelo::store {

namespace {

constexpr int kMostLinks = 40;
constexpr int kOpenDirectory = O_RDONLY | O_DIRECTORY;
constexpr mode_t kDirectoryMode = 0755;

Descriptor duplicate(int directory) { return Descriptor(::fcntl(directory, F_DUPFD_CLOEXEC, 3)); }

// Walks down from the root, part by part, keeping every directory on the way open so that
// ".." in the target of a link leads back to where the walk came from.
class Walk {
public:
    Walk(const Workplace& workplace, std::vector<MadeDirectory>* made)
        : files_(workplace.files), root_(workplace.root), made_(made) {}

    Attempt<Place> to(const std::string& path) {
        queue(path);
        while (parts_.size() > 1) {
            const std::string part = parts_.front();
            parts_.pop_front();
            if (Problem problem = enter(part)) {
                return missing_ ? Attempt<Place>(Place{}) : Refusal{*problem};
            }
        }
        if (parts_.empty()) {
            return made_ == nullptr ? Attempt<Place>(Place{})
                                    : Refusal{"the path has no last part"};
        }
        return here(parts_.front());
    }

private:
    struct Level {
        Descriptor directory;
        std::string name;
    };

    int current() const { return levels_.empty() ? root_.top() : levels_.back().directory.get(); }

    // Puts the parts of `path` in front of those still to be walked.
    void queue(const std::string& path) {
        const Fields parts = splitFields(path, '/');
        for (auto part = parts.rbegin(); part != parts.rend(); ++part) {
            if (!part->empty() && *part != ".") {
                parts_.push_front(*part);
            }
        }
    }

    Problem enter(const std::string& part) {
        if (part == "..") {
            if (!levels_.empty()) {
                levels_.pop_back();
            }
            return {};
        }
        struct stat status {};
        if (!files_.statusAt(current(), part, status)) {
            return errno == ENOENT ? enterMissing(part) : Problem("a directory cannot be read");
        }
        if (S_ISLNK(status.st_mode)) {
            return follow(part, status);
        }
        missing_ = made_ == nullptr && !S_ISDIR(status.st_mode);
        return missing_ ? Problem("a part of the path is no directory") : descend(part);
    }

    Problem enterMissing(const std::string& part) {
        if (made_ == nullptr) {
            missing_ = true;
            return "a directory on the path is missing";
        }
        // Noted first: what is made must be known even when there is no memory to note it.
        made_->push_back({duplicate(current()), part});
        if (!made_->back().parent || !files_.makeDirectory(current(), part, 0700)) {
            made_->pop_back();
            return "a directory on the path cannot be made";
        }
        if (Problem problem = descend(part)) {
            return problem;
        }
        return files_.changeMode(current(), kDirectoryMode)
                   ? Problem()
                   : Problem("a directory on the path cannot be made");
    }

    Problem descend(const std::string& part) {
        Descriptor directory = files_.open(current(), part, kOpenDirectory);
        if (!directory) {
            return "a directory on the path cannot be opened";
        }
        levels_.push_back({std::move(directory), part});
        return {};
    }

    Problem follow(const std::string& part, const struct stat& status) {
        std::string target;
        if (status.st_uid != 0 && status.st_uid != ::geteuid()) {
            return "a part of the path is another user's symbolic link";
        }
        if (++links_ > kMostLinks || !files_.readSymlink(current(), part, target)) {
            return "a symbolic link on the path cannot be followed";
        }
        if (!target.empty() && target.front() == '/') {
            levels_.clear();
        }
        queue(target);
        return {};
    }

    Attempt<Place> here(const std::string& name) {
        Place place;
        place.parent = duplicate(current());
        place.name = name;
        for (const Level& level : levels_) {
            place.path += "/" + level.name;
        }
        place.path += "/" + name;
        if (!place.parent || name == "..") {
            return Refusal{"the path cannot be opened"};
        }
        return place;
    }

    FileSystem& files_;
    const RootDirectory& root_;
    std::vector<MadeDirectory>* made_;
    std::deque<std::string> parts_;
    std::vector<Level> levels_;
    int links_ = 0;
    // Whether the walk ended where there is nothing to find.
    bool missing_ = false;
};

} // namespace

Attempt<Place> findInRoot(const Workplace& workplace, const std::string& path) {
    return Walk(workplace, nullptr).to(path);
}

Attempt<Place> ensureParentInRoot(const Workplace& workplace, const std::string& path,
                                  std::vector<MadeDirectory>& made) {
    return Walk(workplace, &made).to(path);
}

} // namespace qelo::store
