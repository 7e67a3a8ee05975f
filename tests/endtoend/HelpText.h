// What the program's own help lists, for tests of what has to list the same.
#pragma once

#include "Qelosim.h"

#include <regex>
#include <sstream>

namespace qelo::endtoend {

// The first group of each line that fits the pattern.
inline std::vector<std::string> listedIn(const std::vector<std::string>& command,
                                         const std::string& pattern) {
    const Finished help = qelosim(command);
    EXPECT_EQ(help.status, 0) << help.err;
    std::vector<std::string> found;
    std::istringstream lines(help.out);
    const std::regex shape(pattern);
    for (std::string line; std::getline(lines, line);) {
        std::smatch match;
        if (std::regex_search(line, match, shape)) {
            found.push_back(match[1]);
        }
    }
    return found;
}

inline std::vector<std::string> commandsOfHelp() {
    const auto commands = listedIn({"--help"}, "^  ([a-z][-a-z]*) ");
    EXPECT_GT(commands.size(), 20U);
    return commands;
}

// The long options of a command, those of all commands included.
inline std::vector<std::string> optionsOfHelp(const std::string& command) {
    const auto options = listedIn({command, "--help"}, "^  (?:-[a-z], ?)?(--[a-z][-a-z]*)");
    EXPECT_GT(options.size(), 5U) << command;
    return options;
}

} // namespace qelo::endtoend
