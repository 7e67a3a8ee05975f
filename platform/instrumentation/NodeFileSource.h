// A node file (NodeFile.h) as source of nodes, for tests, demos and simulated fleets. It is
// never written: commands are refused, which the log tells. A file that cannot be read, is refused
// or has more than 64 MiB makes every selection fail.
#pragma once

#include "Source.h"

namespace qelo::nodes {

class NodeFileSource : public Source {
public:
    NodeFileSource(std::string path, Files& files);

    std::shared_ptr<const Snapshot> take() override;
    bool execute(const std::string& command, std::string& status) override;

private:
    std::string path_;
    Files& files_;
};

} // namespace qelo::nodes
