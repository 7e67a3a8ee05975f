#include "SnapshotBuilder.h"

#include <cerrno>
#include <system_error>

namespace qelo::nodes {

namespace {

constexpr std::size_t largestFile = 256UL * 1024 * 1024;

class WipedAtEnd {
public:
    explicit WipedAtEnd(std::string& text) : text_(text) {}
    ~WipedAtEnd() { wipe(text_); }
    WipedAtEnd(const WipedAtEnd&) = delete;
    WipedAtEnd& operator=(const WipedAtEnd&) = delete;

private:
    std::string& text_;
};

} // namespace

bool isPassing(int error) {
    return error != 0 && error != ENOENT && error != ENOTDIR && error != EACCES && error != ELOOP &&
           error != EINVAL && error != EFBIG;
}

std::string errorText(int error) {
    if (error == EFBIG) {
        return "cannot be read: too large";
    }
    if (error == EINVAL) {
        return "cannot be read: not a regular file";
    }
    return "cannot be read: " + std::generic_category().message(error);
}

SnapshotBuilder::SnapshotBuilder(const std::filesystem::path& root, Files& files)
    : root_(root), files_(files), snapshot_(std::make_shared<Snapshot>()) {
    snapshot_->takenNs = files_.now();
}

std::string SnapshotBuilder::reportError(const std::string& path, const FileStamp& stamp,
                                         int error) {
    snapshot_->reports.push_back({path, stamp, errorText(error)});
    return path + " " + errorText(error);
}

bool SnapshotBuilder::checkRoot() {
    // "/." is there only below a directory. Its own stamp is not watched: it changes with
    // every file that comes or goes beside the database.
    const FileStamp stamp = files_.stamp(pathOf("."));
    if (stamp.error == 0) {
        return true;
    }
    snapshot_->files.push_back({pathOf("."), stamp, isPassing(stamp.error)});
    snapshot_->failAll(reportError(root_.string(), stamp, stamp.error));
    return false;
}

std::optional<std::string> SnapshotBuilder::readFile(const std::string& name, Presence presence,
                                                     const Use& use) {
    const std::string path = pathOf(name);
    FileContent content = files_.read(path, largestFile);
    const WipedAtEnd wiped(content.bytes);
    snapshot_->files.push_back({path, content.stamp, isPassing(content.error)});
    if (content.error != 0) {
        if (presence == Presence::optional && content.error == ENOENT) {
            return std::nullopt;
        }
        return reportError(path, content.stamp, content.error);
    }
    Damage damage;
    use(content.bytes, damage);
    if (!damage.empty()) {
        snapshot_->reports.push_back({path, content.stamp, damage.text()});
    }
    return std::nullopt;
}

std::vector<std::string> SnapshotBuilder::list(const std::string& name) {
    const std::string path = pathOf(name);
    snapshot_->files.push_back({path, files_.stamp(path), false});
    return files_.list(path);
}

} // namespace qelo::nodes
