// Short ways to look at a store through cursors.
#pragma once

#include "NodeCursor.h"
#include "ScratchRoot.h"
#include "StoreChoice.h"

#include <NodeLexicon.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace qelo::nodes::tests {

// The Name of every node of a type, in order.
std::vector<std::string> namesOf(const std::shared_ptr<NodeStore>& store, int type);

// A cursor on the node of a type with that Name; it stands nowhere when there is none.
NodeCursor cursorOn(const std::shared_ptr<NodeStore>& store, int type, const std::string& name);

// A property of an account; nothing when the account or the property is missing.
std::optional<std::string> accountText(const std::shared_ptr<NodeStore>& store,
                                       const std::string& name, int id);
std::optional<unsigned int> accountNumber(const std::shared_ptr<NodeStore>& store,
                                          const std::string& name, int id);

// The store of a scratch root.
std::shared_ptr<NodeStore> storeOf(const ScratchRoot& root);

// The what() of the std::runtime_error that `action` throws; empty when it throws none.
std::string errorOf(const std::function<void()>& action);

} // namespace qelo::nodes::tests
