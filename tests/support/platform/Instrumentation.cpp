#include "RecordingPort.h"

#include <Instrumentation.h>

#include <memory>

using qelo::test::CursorState;
using qelo::test::PropertyValue;
using qelo::test::RecordingPort;

namespace Tesk {

struct Instrumentation::Cursor : CursorState {};

namespace {

template <class Value>
bool readInto(CursorState& cursor, NodeLexicon::Properties id, Value& value) {
    const std::optional<PropertyValue> found = RecordingPort::read(cursor, id, Value{});
    if (found) {
        value = std::get<Value>(*found);
    }
    return found.has_value();
}

} // namespace

Instrumentation::Instrumentation() : cursor_(nullptr) {
    auto cursor = std::make_unique<Cursor>();
    RecordingPort::open(*cursor);
    cursor_ = cursor.release();
}

Instrumentation::~Instrumentation() {
    RecordingPort::close(*cursor_);
    delete cursor_;
}

bool Instrumentation::selectNode(NodeLexicon::NodeType type) {
    return RecordingPort::select(*cursor_, type);
}

bool Instrumentation::setFilter(NodeLexicon::PathType kind, const std::string& path) {
    return RecordingPort::narrow(*cursor_, kind, path);
}

Instrumentation::operator bool() const { return RecordingPort::valid(*cursor_); }

Instrumentation& Instrumentation::operator++() {
    RecordingPort::advance(*cursor_);
    return *this;
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, std::string& value) {
    return readInto(*cursor_, id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, unsigned int& value) {
    return readInto(*cursor_, id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, std::vector<unsigned int>& value) {
    return readInto(*cursor_, id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, std::vector<std::string>& value) {
    return readInto(*cursor_, id, value);
}

bool Instrumentation::setProperty(NodeLexicon::Properties id, std::string& value) {
    return RecordingPort::write(*cursor_, id, value);
}

bool Instrumentation::setProperty(NodeLexicon::Properties id, unsigned int& value) {
    return RecordingPort::write(*cursor_, id, value);
}

std::string Instrumentation::getPathToNode() { return RecordingPort::path(*cursor_); }

std::string Instrumentation::convertPathToString(const std::string& path) {
    return RecordingPort::printablePath(*cursor_, path);
}

unsigned int Instrumentation::getNodeSize() { return RecordingPort::size(*cursor_); }

} // namespace Tesk
