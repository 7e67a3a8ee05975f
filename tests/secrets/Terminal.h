// Runs a program that asks questions on its terminal.
#pragma once

#include "endtoend/Process.h"

namespace qelo::secrets {

// Types each answer after a question (what ends in ": ") and waits for the end of the program.
// All that the terminal showed is in `out`.
endtoend::Finished runAndAnswer(const std::vector<std::string>& command,
                                const std::vector<std::string>& answers,
                                const endtoend::Variables& variables = {});

} // namespace qelo::secrets
