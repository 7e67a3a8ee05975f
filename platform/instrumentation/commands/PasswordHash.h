// Hashing of passwords with the C library's crypt.
#pragma once

#include "Attempt.h"
#include "Secret.h"

namespace qelo::store {

// The hash of `password` with the system's preferred method and a fresh salt, in the form of
// the shadow file's password field. Every other copy of either text is wiped. For any thread.
Attempt<Secret> hashPassword(const Secret& password);

} // namespace qelo::store
