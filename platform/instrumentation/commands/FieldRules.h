// What may be written into a field of the account files, or used as a name in them.
// Pure functions; for any thread. Reasons never quote the text.
#pragma once

#include "Attempt.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace qelo::store {

// Names of accounts and groups that are to be created: ^[a-z_][a-z0-9_-]{0,30}$
Problem checkNewName(std::string_view name);

// Names of accounts and groups said to exist: anything that fits a field of the files.
Problem checkExistingName(std::string_view name);

// The first field of the comment column. May be empty.
Problem checkFullName(std::string_view text);

// Absolute, without empty parts and without "." and "..".
Problem checkPath(std::string_view path);

Problem checkPassword(std::string_view password);

// A number from 0 to 2147483647 in its shortest decimal form.
Attempt<std::uint32_t> parseNumber(std::string_view text);

// `text` for a message: what is not printable ASCII is replaced by "?".
std::string printable(std::string_view text);

} // namespace qelo::store
