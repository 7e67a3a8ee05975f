// The JSON form of nodes:
//
//   {"nodes": [{"type": 46, "path": "/UserAdministration/1/UserAccount/alice",
//               "properties": {"108": "alice", "123": 1, "137": [1, 2], "165": ["a", "b"]}}]}
//
// "properties" may be left out. A property is named by its number in plain decimal form; its
// value is a text, a whole number from 0 to 4294967295, or a list of one of the two. An empty
// list counts as both kinds. Everything else is refused: other members, members given twice,
// other values, lists of mixed kinds, nesting beyond this form, text that is not JSON or not
// UTF-8, anything after the document.
#pragma once

#include "Node.h"

#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace qelo::nodes {

// The nodes of a document with their types, in its order.
struct NodeDocument {
    std::vector<std::pair<int, Node>> nodes;
    std::optional<std::string> error; // why it was refused, naming the node; then no nodes
};

// Never throws but for a lack of memory. The depth of nesting costs no stack.
NodeDocument parseNodes(const std::string& text);

} // namespace qelo::nodes
