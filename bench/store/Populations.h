// Account databases and node files of any size, in a scratch directory.
#pragma once

#include <filesystem>
#include <string>

namespace qelo::bench {

// Both forms of the same accounts and a tenth as many groups; removed with the owner.
class Population {
public:
    explicit Population(int accounts);
    ~Population();
    Population(const Population&) = delete;
    Population& operator=(const Population&) = delete;

    // Values for QELO_NODE_STORE.
    std::string accountsChoice() const { return "accounts:" + root_.string(); }
    std::string fileChoice() const { return "file:" + (root_ / "nodes.json").string(); }

private:
    std::filesystem::path root_;
};

} // namespace qelo::bench
