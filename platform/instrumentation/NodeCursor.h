// A position in a selection of nodes. Shares the snapshot that it was selected from and
// copies no node; what happens to the store meanwhile does not change the selection. For
// one thread.
#pragma once

#include "NodeStore.h"

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace qelo::nodes {

class NodeCursor {
public:
    explicit NodeCursor(std::shared_ptr<NodeStore> store);

    // Stands on the first node of a type. False when there is none. Throws
    // std::runtime_error with the reason when the store cannot be read; then nothing is
    // selected.
    bool select(int type);

    // Keeps the nodes that lie under a path and stands on the first. False when there is none.
    bool keepUnder(const std::string& path);

    // Leaves nothing selected.
    void clear();

    bool valid() const { return nodes_ && at_ < nodes_->size(); }
    void advance();

    // Copies a property of the current node; false when it has none of that type. The number
    // of entries is that of the store now, unless the node states one.
    bool read(int id, std::string& value) const;
    bool read(int id, unsigned int& value) const;
    bool read(int id, std::vector<unsigned int>& value) const;
    bool read(int id, std::vector<std::string>& value) const;

    // Only a command and a refresh request can be written, and only to an administration node.
    bool write(int id, const std::string& value);
    bool write(int id, unsigned int value);

    std::string path() const;
    unsigned int size() const { return size_; }

private:
    template <class T> bool readNode(int id, T& value) const;
    bool isSelected(const Node& node) const;
    void toSelected();
    bool countNow(unsigned int& value) const;
    bool onAdministration() const;

    std::shared_ptr<NodeStore> store_;
    std::shared_ptr<const Snapshot> snapshot_;
    const std::vector<Node>* nodes_ = nullptr; // within the snapshot
    int type_ = 0;
    std::vector<std::string> ancestors_;
    std::size_t at_ = 0;
    unsigned int size_ = 0;
    std::optional<std::string> status_; // of the last command
};

} // namespace qelo::nodes
