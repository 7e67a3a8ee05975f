// Memory that runs out once, at a chosen allocation of a chosen library.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace qelo::test {

// For one thread at a time: only allocations of the thread that armed it count.
class FailingAllocation {
public:
    // From now on the n-th allocation (from 1) that the code of `library`, the path of a
    // loaded shared library, asks for throws std::bad_alloc. What the C++ library allocates on
    // its behalf counts too; what other libraries allocate, even when called by it, does not.
    // 0 is none.
    static void arm(const std::string& library, std::size_t n);

    // The same for several libraries, at most eight, which count together.
    using Files = std::vector<std::string>;
    static void arm(const Files& libraries, std::size_t n);

    // From now on nothing fails any more, but blocks are counted on. True when the allocation
    // was reached.
    static bool stopFailing();

    // Ends it. True when the allocation was reached.
    static bool disarm();

    // How many allocations of these libraries there were since arm(), up to the failed one. All
    // of them when none failed.
    static std::size_t reached();

    // The same blocks, those after the failed one included, that were not freed up to disarm().
    // Only counted when asked for: the program then runs far slower.
    static void countBlocks(bool on);
    static std::size_t blocksLeft();
};

} // namespace qelo::test
