// The text of a file of expected outcomes: written and read.
#pragma once

#include "ExpectedOutcomes.h"

namespace qelo::test {

// "addKey 1-8, getKey 2": calls by kind, in the order of the alphabet.
std::string callsText(const std::set<NthCall>& calls);
std::set<NthCall> callsOf(const std::string& text);

// The lines of one operation, all indented, without its name.
std::string bodyText(const OperationOutcomes& outcomes, const std::vector<std::string>& ways);

// The operations of a text. Throws std::runtime_error for one that cannot be read.
std::map<std::string, OperationOutcomes> parsed(const std::string& text,
                                                const std::vector<std::string>& ways);

} // namespace qelo::test
