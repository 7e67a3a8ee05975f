// Which store this process works on: environment variable QELO_NODE_STORE.
//
//   accounts:DIR   the account database below a root directory
//   file:PATH      a node file
//
// Unset or empty means "accounts:/". Any other text is reported in the log and gives a
// store whose every selection fails. In a program that runs with raised rights (set-user-ID)
// the variable is not looked at.
#pragma once

#include "NodeStore.h"

#include <memory>
#include <string>

namespace qelo::nodes {

// The store of the variable's present value. Stores are kept by value, so that cursors of
// one store share its snapshot; the ones longest unused are forgotten when there are many.
// For any thread, as long as none changes the environment meanwhile.
std::shared_ptr<NodeStore> chosenStore();

// A store for such a text. A relative path is resolved now. The files have to outlive it.
std::shared_ptr<NodeStore> makeStore(const std::string& choice, Files& files);

} // namespace qelo::nodes
