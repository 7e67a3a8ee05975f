// Node store of the platform (libqeloinstrumentationenvelope.so.1).
//
// An Instrumentation is a cursor over the nodes of one type. A cursor belongs to one thread
// and one call; several cursors may be used at once. Any member but the destructor may
// throw a std::exception when the store fails.
#pragma once

#include "NodeLexicon.h"

#include <platform/PlatformApi.h>

#include <string>
#include <vector>

namespace Tesk {

class QELO_PLATFORM_API Instrumentation {
public:
    // A cursor without a selection.
    Instrumentation();
    ~Instrumentation();
    Instrumentation(const Instrumentation&) = delete;
    Instrumentation& operator=(const Instrumentation&) = delete;

    // Selects all nodes of a type and stands on the first. True when there is one.
    bool selectNode(NodeLexicon::NodeType type);

    // Keeps of the selection the nodes under `path` (a result of getPathToNode) and stands
    // on the first. True when there is one.
    bool setFilter(NodeLexicon::PathType kind, const std::string& path);

    // True while the cursor stands on a node.
    operator bool() const;

    // Moves to the next node of the selection.
    Instrumentation& operator++();

    // Reads a property of the node under the cursor. True when the node has it with a value
    // of that type; otherwise false, and `value` is left as it was.
    bool getProperty(NodeLexicon::Properties id, std::string& value);
    bool getProperty(NodeLexicon::Properties id, unsigned int& value);
    bool getProperty(NodeLexicon::Properties id, std::vector<unsigned int>& value);
    bool getProperty(NodeLexicon::Properties id, std::vector<std::string>& value);

    // Writes a property of the node under the cursor. True on success. A text written to
    // AdminCommand is carried out as a command; its status text is read back from there.
    bool setProperty(NodeLexicon::Properties id, std::string& value);
    bool setProperty(NodeLexicon::Properties id, unsigned int& value);

    // The store's path of the node under the cursor; empty when there is none.
    std::string getPathToNode();

    // A printable form of such a path, the same each time for the same node.
    std::string convertPathToString(const std::string& path);

    // The number of nodes in the selection.
    unsigned int getNodeSize();

private:
    struct Cursor;
    Cursor* cursor_;
};

} // namespace Tesk
