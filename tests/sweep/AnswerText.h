// What the caller of an operation got, in words.
#pragma once

#include "SweptLibrary.h"

#include <set>
#include <string>

namespace qelo::test {

// "OK, done" or "FAILED \"Create CMPIObjectPath failed.\", not done".
std::string answerText(const SweptRun& run);

// The same with the number of results and of calls: the good run's own text. Not `exactly` tells
// only whether there are calls.
std::string goodText(const SweptRun& run, std::size_t calls, bool exactly = true);

// The answer with the results as against those of the good run: "all", "none", "1 of 2",
// "2 of 2, 1 altered".
std::string faultyText(const SweptRun& run, const SweptRun& good);

// The texts for a run with that fault: also one that says "its status" in place of the status, if
// that is the one that the failing call left.
std::set<std::string> faultyTexts(const SweptRun& run, const SweptRun& good, const Fault& fault);

} // namespace qelo::test
