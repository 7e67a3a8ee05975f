// All nodes of a source at one moment. Built by a source, immutable afterwards and shared by
// every cursor that stands in it, from any thread.
#pragma once

#include "Files.h"
#include "Node.h"

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace qelo::nodes {

// A file that a snapshot depends on, in the state in which it was read.
struct WatchedFile {
    std::string path;
    FileStamp stamp;
    bool passing = false; // the read failed in a way that can pass without a change of the file
};

// What the log should say about a file in that state.
struct FileReport {
    std::string path;
    FileStamp stamp;
    std::string text;
};

class Snapshot {
public:
    // The nodes of a type in the order of their source. Throws std::runtime_error with the
    // reason when they could not be read, so that a client never takes a failure for an
    // empty system.
    const std::vector<Node>& nodes(int type) const;

    // For the source that builds the snapshot.
    void add(int type, Node node) { nodes_[type].push_back(std::move(node)); }
    void reserve(int type, std::size_t count) { nodes_[type].reserve(count); }
    void fail(int type, std::string reason) { failures_[type] = std::move(reason); }
    void failAll(std::string reason) { failure_ = std::move(reason); }

    std::vector<WatchedFile> files;
    std::vector<FileReport> reports;
    std::int64_t takenNs = 0;        // when the first file was about to be read
    std::optional<std::int64_t> day; // days since 1970, when a value depends on the date

private:
    std::map<int, std::vector<Node>> nodes_;
    std::map<int, std::string> failures_;
    std::optional<std::string> failure_;
};

} // namespace qelo::nodes
