#include "Tree.h"

#include <array>
#include <fcntl.h>
#include <vector>

namespace qelo::store {

namespace {

constexpr int kDeepest = 32;
constexpr mode_t kPermissions = 0777;

class Copy {
public:
    Copy(FileSystem& files, Owner owner) : files_(files), owner_(owner) {}

    bool below(int from, int to, int depth) {
        std::vector<std::string> names;
        if (depth > kDeepest || !files_.list(from, names)) {
            return false;
        }
        for (const std::string& name : names) {
            if (!entry(from, to, name, depth)) {
                return false;
            }
        }
        return true;
    }

private:
    bool entry(int from, int to, const std::string& name, int depth) {
        struct stat status {};
        if (!files_.statusAt(from, name, status)) {
            return false;
        }
        switch (status.st_mode & S_IFMT) {
        case S_IFDIR:
            return directory(from, to, name, depth);
        case S_IFREG:
            return plainFile(from, to, name);
        case S_IFLNK:
            return symlink(from, to, name);
        default:
            return true;
        }
    }

    // Owner first: giving a file away may clear permission bits.
    bool finish(int file, mode_t mode) {
        return files_.changeOwner(file, owner_.user, owner_.group) &&
               files_.changeMode(file, mode & kPermissions);
    }

    bool directory(int from, int to, const std::string& name, int depth) {
        const Descriptor source = files_.open(from, name, O_RDONLY | O_DIRECTORY);
        struct stat status {};
        if (!source || !files_.status(source.get(), status) ||
            !files_.makeDirectory(to, name, 0700)) {
            return false;
        }
        const Descriptor target = files_.open(to, name, O_RDONLY | O_DIRECTORY);
        return target && below(source.get(), target.get(), depth + 1) &&
               finish(target.get(), status.st_mode);
    }

    bool plainFile(int from, int to, const std::string& name) {
        const Descriptor source = files_.open(from, name, O_RDONLY | O_NONBLOCK);
        const Descriptor target = files_.open(to, name, O_WRONLY | O_CREAT | O_EXCL, 0600);
        struct stat status {};
        return source && target && files_.status(source.get(), status) && S_ISREG(status.st_mode) &&
               content(source.get(), target.get()) && finish(target.get(), status.st_mode);
    }

    bool content(int from, int to) {
        std::array<char, 8192> buffer{};
        ssize_t count = 0;
        while ((count = files_.read(from, buffer.data(), buffer.size())) > 0) {
            for (ssize_t done = 0; done < count;) {
                const ssize_t written =
                    files_.write(to, buffer.data() + done, static_cast<std::size_t>(count - done));
                if (written <= 0) {
                    return false;
                }
                done += written;
            }
        }
        return count == 0;
    }

    bool symlink(int from, int to, const std::string& name) {
        std::string target;
        return files_.readSymlink(from, name, target) && files_.makeSymlink(target, to, name) &&
               files_.changeOwnerAt(to, name, owner_.user, owner_.group);
    }

    FileSystem& files_;
    Owner owner_;
};

} // namespace

Problem copyTree(FileSystem& files, int from, int to, Owner owner) {
    return Copy(files, owner).below(from, to, 0) ? Problem()
                                                 : Problem("the skeleton cannot be copied");
}

} // namespace qelo::store
