// Runs a program to its end and keeps what it said.
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace qelo::endtoend {

struct Finished {
    int status = -1; // the exit status; 128 + N when signal N ended it, -1 when it hung
    std::string out;
    std::string err;
};

using Variables = std::vector<std::pair<std::string, std::string>>;

// `command[0]` is looked up in PATH. The environment is this process's own with `variables`
// added. Standard input is empty. A program that runs for more than two minutes is ended.
Finished runProcess(const std::vector<std::string>& command, const Variables& variables = {});

// The same with `input`, at most a pipe's 64 KiB, on standard input, which is empty otherwise.
Finished runProcessWithInput(const std::string& input, const std::vector<std::string>& command,
                             const Variables& variables = {});

// As runProcess, with standard output on an open descriptor, or closed where that is -1.
Finished runProcessInto(int output, const std::vector<std::string>& command,
                        const Variables& variables = {});

} // namespace qelo::endtoend
