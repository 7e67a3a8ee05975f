#include "NodeCursor.h"

#include "Report.h"
#include "Text.h"

#include <NodeLexicon.h>

#include <algorithm>
#include <exception>
#include <new>

namespace qelo::nodes {

namespace {

using namespace Tesk::NodeLexicon;

} // namespace

NodeCursor::NodeCursor(std::shared_ptr<NodeStore> store) : store_(std::move(store)) {}

void NodeCursor::clear() {
    nodes_ = nullptr;
    snapshot_.reset();
    ancestors_.clear();
    status_.reset();
    at_ = 0;
    size_ = 0;
}

bool NodeCursor::select(int type) {
    clear();
    snapshot_ = store_->current();
    nodes_ = &snapshot_->nodes(type);
    type_ = type;
    size_ = static_cast<unsigned int>(nodes_->size());
    return valid();
}

bool NodeCursor::isSelected(const Node& node) const {
    return std::all_of(ancestors_.begin(), ancestors_.end(), [&](const std::string& ancestor) {
        return liesUnder(node.path(), ancestor);
    });
}

void NodeCursor::toSelected() {
    while (valid() && !isSelected((*nodes_)[at_])) {
        ++at_;
    }
}

bool NodeCursor::keepUnder(const std::string& path) {
    if (!nodes_) {
        return false;
    }
    ancestors_.push_back(path);
    status_.reset();
    size_ = static_cast<unsigned int>(std::count_if(
        nodes_->begin(), nodes_->end(), [this](const Node& node) { return isSelected(node); }));
    at_ = 0;
    toSelected();
    return valid();
}

void NodeCursor::advance() {
    if (!valid()) {
        return;
    }
    status_.reset();
    ++at_;
    toSelected();
}

template <class T> bool NodeCursor::readNode(int id, T& value) const {
    return valid() && (*nodes_)[at_].read(id, value);
}

bool NodeCursor::read(int id, std::string& value) const {
    if (id != AdminCommand || !status_) {
        return readNode(id, value);
    }
    try {
        value = *status_;
        return true;
    } catch (const std::bad_alloc&) {
        // The command is done: better no text than word of a failure.
        return false;
    }
}

bool NodeCursor::countNow(unsigned int& value) const {
    value = static_cast<unsigned int>(store_->current()->nodes(type_).size());
    return true;
}

bool NodeCursor::read(int id, unsigned int& value) const {
    if (id == EntryCount && valid() && !(*nodes_)[at_].has(id)) {
        return countNow(value);
    }
    return readNode(id, value);
}

bool NodeCursor::read(int id, std::vector<unsigned int>& value) const {
    return readNode(id, value);
}

bool NodeCursor::read(int id, std::vector<std::string>& value) const { return readNode(id, value); }

bool NodeCursor::onAdministration() const { return valid() && type_ == UserAdministration; }

bool NodeCursor::write(int id, const std::string& value) {
    if (id != AdminCommand || !onAdministration()) {
        return false;
    }
    try {
        std::string status;
        if (!store_->execute(value, status)) {
            return false;
        }
        status_ = std::move(status);
        return true;
    } catch (const std::exception& error) {
        // The command itself may hold a password, and is not told.
        logFailure(std::string("a command failed: ") + error.what());
        return false;
    }
}

bool NodeCursor::write(int id, unsigned int value) {
    if (id != RefreshRequest || value != 0 || !onAdministration()) {
        return false;
    }
    store_->refresh();
    return true;
}

std::string NodeCursor::path() const { return valid() ? (*nodes_)[at_].path() : std::string(); }

} // namespace qelo::nodes
