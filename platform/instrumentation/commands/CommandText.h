// The text form of an administration command, taken apart.
//
//   METHOD,NAME:TYPE:VALUE,NAME:TYPE:VALUE...
//
// with the types CMPI_string, CMPI_uint32 (decimal, printed as a signed number) and
// CMPI_dateTime. Nothing is quoted: a value cannot hold ",", a text value can hold ":".
#pragma once

#include "Attempt.h"

#include <cstddef>
#include <string_view>
#include <vector>

namespace qelo::store {

enum class ArgumentType { Text, Number, DateTime };

struct CommandArgument {
    std::string_view name;
    ArgumentType type;
    std::string_view value;
};

struct CommandText {
    std::string_view method;
    std::vector<CommandArgument> arguments;
};

// The sender's buffer ends here, so a longer text, and one of just this length, may have
// lost its end on the way.
constexpr std::size_t kCutLength = 1023;

// Takes `text` apart. The result views into `text`: nothing, a password included, is copied.
// Refuses what may have been cut, control characters, and every deviation from the form;
// the reason never quotes the text. Pure; for any thread.
Attempt<CommandText> parseCommandText(std::string_view text);

} // namespace qelo::store
