// One node of the store: a path and properties. Immutable once it is part of a snapshot.
#pragma once

#include "Properties.h"

#include <memory>
#include <string>
#include <utility>

namespace qelo::nodes {

class Node {
public:
    // Both sets of properties are sealed. `shared` holds what many nodes have in common; it
    // may be null. A property of the node's own goes before a shared one.
    Node(std::string path, Properties own, std::shared_ptr<const Properties> shared = nullptr)
        : path_(std::move(path)), own_(std::move(own)), shared_(std::move(shared)) {}

    const std::string& path() const { return path_; }

    bool has(int id) const { return own_.has(id) || (shared_ && shared_->has(id)); }

    // Copies a property of the wanted type, as Properties::read.
    template <class T> bool read(int id, T& value) const {
        return own_.has(id) || !shared_ ? own_.read(id, value) : shared_->read(id, value);
    }

private:
    std::string path_;
    Properties own_;
    std::shared_ptr<const Properties> shared_;
};

} // namespace qelo::nodes
