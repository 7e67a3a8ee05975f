#include "NodeFileSource.h"

#include "NodeFile.h"
#include "SnapshotBuilder.h"

#ifdef QELO_WITH_COMMANDS
#include "commands/AdminCommand.h"
#endif

namespace qelo::nodes {

namespace {

constexpr std::size_t largestFile = 64UL * 1024 * 1024;

std::optional<std::string> addNodes(Snapshot& snapshot, const FileContent& content) {
    if (content.error != 0) {
        return errorText(content.error);
    }
    NodeDocument document = parseNodes(content.bytes);
    if (document.error) {
        return "refused: " + *document.error;
    }
    for (auto& [type, node] : document.nodes) {
        snapshot.add(type, std::move(node));
    }
    return std::nullopt;
}

} // namespace

NodeFileSource::NodeFileSource(std::string path, Files& files)
    : path_(std::move(path)), files_(files) {}

std::shared_ptr<const Snapshot> NodeFileSource::take() {
    auto snapshot = std::make_shared<Snapshot>();
    snapshot->takenNs = files_.now();
    const FileContent content = files_.read(path_, largestFile);
    snapshot->files.push_back({path_, content.stamp, isPassing(content.error)});
    if (const auto error = addNodes(*snapshot, content)) {
        snapshot->reports.push_back({path_, content.stamp, *error});
        snapshot->failAll("node file " + path_ + " " + *error);
    }
    return snapshot;
}

bool NodeFileSource::execute(const std::string&, std::string&) {
#ifdef QELO_WITH_COMMANDS
    qelo::store::logRefusedCommand("a node file takes no commands");
#endif
    return false;
}

} // namespace qelo::nodes
