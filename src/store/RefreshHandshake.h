// The refresh handshake with the node store: when the number of entries that the store
// believes in differs from the number of nodes it serves, it is asked to re-read.
#pragma once

#include "Instrumentation.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Compares the two counts for the nodes of one type and asks for a re-read where they
// differ. `traceCounts(entryCount, nodeSize)` is called once the counts are known. A store
// without such nodes is left alone; whatever the store throws goes to the caller.
template <class TraceCounts>
void requestRefreshWhenStale(NodeLexicon::NodeType type, TraceCounts traceCounts) {
    Instrumentation nodes;
    nodes.selectNode(type);
    if (!nodes) {
        return;
    }
    // A node without the property leaves the count at 0.
    unsigned int entryCount = 0;
    nodes.getProperty(NodeLexicon::EntryCount, entryCount);
    const unsigned int nodeSize = nodes.getNodeSize();
    traceCounts(entryCount, nodeSize);
    if (entryCount == nodeSize) {
        return;
    }
    Instrumentation administration;
    administration.selectNode(NodeLexicon::UserAdministration);
    if (administration) {
        unsigned int reRead = 0;
        administration.setProperty(NodeLexicon::RefreshRequest, reRead);
    }
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
