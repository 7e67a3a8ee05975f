// How far a sweep goes, and what it tells about how far it went.
#pragma once

#include <cstddef>
#include <string>

namespace qelo::test {

// Whether the environment variable QELO_SWEEP asks for the long form of each sweep.
bool isLongSweep();

// Tells how many faults a part of a sweep has injected, in the output and in the test report.
// The program tells the sum over all its parts at its end. A part without any fault has to be
// one that calls nothing outside it: the caller checks that.
void countFaults(const std::string& part, std::size_t operations, std::size_t faults);

// The same for a part in which nothing is made to fail, and many operations run at once.
void countOperations(const std::string& part, std::size_t operations);

} // namespace qelo::test
