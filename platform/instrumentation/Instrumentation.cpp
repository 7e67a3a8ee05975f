#include <Instrumentation.h>

#include "NodeCursor.h"
#include "StoreChoice.h"
#include "Text.h"

namespace Tesk {

struct Instrumentation::Cursor : qelo::nodes::NodeCursor {
    using NodeCursor::NodeCursor;
};

Instrumentation::Instrumentation() : cursor_(new Cursor(qelo::nodes::chosenStore())) {}

Instrumentation::~Instrumentation() { delete cursor_; }

bool Instrumentation::selectNode(NodeLexicon::NodeType type) { return cursor_->select(type); }

bool Instrumentation::setFilter(NodeLexicon::PathType kind, const std::string& path) {
    if (kind == NodeLexicon::ParentPath) {
        return cursor_->keepUnder(path);
    }
    // No node is known to match, and a filter must not widen what a caller sees.
    cursor_->clear();
    return false;
}

Instrumentation::operator bool() const { return cursor_->valid(); }

Instrumentation& Instrumentation::operator++() {
    cursor_->advance();
    return *this;
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, std::string& value) {
    return cursor_->read(id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, unsigned int& value) {
    return cursor_->read(id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, std::vector<unsigned int>& value) {
    return cursor_->read(id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, std::vector<std::string>& value) {
    return cursor_->read(id, value);
}

bool Instrumentation::setProperty(NodeLexicon::Properties id, std::string& value) {
    return cursor_->write(id, value);
}

bool Instrumentation::setProperty(NodeLexicon::Properties id, unsigned int& value) {
    return cursor_->write(id, value);
}

std::string Instrumentation::getPathToNode() { return cursor_->path(); }

std::string Instrumentation::convertPathToString(const std::string& path) {
    return qelo::nodes::printable(path);
}

unsigned int Instrumentation::getNodeSize() { return cursor_->size(); }

} // namespace Tesk
