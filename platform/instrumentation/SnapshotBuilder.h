// Reads the files of an account database into a snapshot: notes each file's state, reports
// what is wrong with it, and wipes its content after use.
#pragma once

#include "Damage.h"
#include "Snapshot.h"

#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace qelo::nodes {

enum class Presence {
    required, // a missing file is reported
    optional, // many systems do not have it
};

class SnapshotBuilder {
public:
    using Use = std::function<void(std::string& text, Damage& damage)>;

    SnapshotBuilder(const std::filesystem::path& root, Files& files);

    // False when the root is not a directory; then the whole snapshot is a failure.
    bool checkRoot();

    // Gives the content of a file below the root to `use`. Returns why it could not be read.
    std::optional<std::string> readFile(const std::string& name, Presence presence, const Use& use);

    // Names of the files in a directory below the root, which is watched from then on.
    std::vector<std::string> list(const std::string& name);

    Snapshot& snapshot() { return *snapshot_; }

    // The finished snapshot. Nothing may be called afterwards.
    std::shared_ptr<const Snapshot> finish() { return std::move(snapshot_); }

private:
    std::string pathOf(const std::string& name) const { return (root_ / name).string(); }
    std::string reportError(const std::string& path, const FileStamp& stamp, int error);

    std::filesystem::path root_;
    Files& files_;
    std::shared_ptr<Snapshot> snapshot_;
};

// True when an error of open or read can pass without the file being changed.
bool isPassing(int error);

// "cannot be read: No such file or directory"
std::string errorText(int error);

} // namespace qelo::nodes
