// How often this process allocated through operator new, its libraries included.
#pragma once

#include <cstdint>

namespace qelo::bench {

std::uint64_t allocationCount();

} // namespace qelo::bench
