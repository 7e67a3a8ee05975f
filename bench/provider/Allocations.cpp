#include "Allocations.h"

#include <atomic>
#include <cstdlib>
#include <new>

namespace {

std::atomic<std::uint64_t> count{0};

} // namespace

// Exported by the program, so that what is loaded later allocates here, too.
__attribute__((visibility("default"))) void* operator new(std::size_t size) {
    // One thread allocates while it is counted; a plain addition suffices.
    count.store(count.load(std::memory_order_relaxed) + 1, std::memory_order_relaxed);
    if (void* memory = std::malloc(size == 0 ? 1 : size)) {
        return memory;
    }
    throw std::bad_alloc();
}

__attribute__((visibility("default"))) void operator delete(void* memory) noexcept {
    std::free(memory);
}

__attribute__((visibility("default"))) void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}

namespace qelo::bench {

std::uint64_t allocationCount() { return count.load(std::memory_order_relaxed); }

} // namespace qelo::bench
