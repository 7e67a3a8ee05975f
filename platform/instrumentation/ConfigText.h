// The two kinds of text that the system's password settings are written in.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::nodes {

// "name = value"; the value is empty where a name stands alone.
struct Setting {
    std::string name;
    std::string value;
    std::size_t line = 0; // 0 where it has none
};

// The settings of a file of such lines, "#" starting a comment, in their order.
std::vector<Setting> readSettings(std::string_view text);

// One line of a PAM service: a module of the stack for password changes, and its arguments.
struct PasswordModule {
    std::string name; // without directory
    std::vector<Setting> arguments;
};

// The modules of type "password" in their order. Includes are not followed.
std::vector<PasswordModule> readPasswordModules(std::string_view text);

// A decimal number that is the whole text.
std::optional<std::int64_t> wholeNumber(std::string_view text);

} // namespace qelo::nodes
