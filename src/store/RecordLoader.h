// Reading the nodes of a selection into records, as every loader of the node store does it.
#pragma once

#include "Instrumentation.h"

#include <utility>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Appends one record per node, from the node under the cursor to the last. `fill(node, record)`
// gives a new record what the node holds; what it throws goes to the caller, with the records
// read so far kept. A record that traces its end does so once the cursor has moved on.
template <class Record, class Fill>
void appendRecords(Instrumentation& nodes, std::vector<Record>& records, Fill fill) {
    while (nodes) {
        Record record;
        fill(nodes, record);
        records.push_back(std::move(record));
        ++nodes;
    }
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
