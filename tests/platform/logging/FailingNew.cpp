#include "FailingNew.h"

#include <cstdlib>
#include <new>

namespace {

thread_local int callsToFailure = 0; // 0: none is to fail
thread_local bool failed = false;

} // namespace

namespace qelo::test {

FailingNew::FailingNew(int position) {
    failed = false;
    callsToFailure = position;
}

FailingNew::~FailingNew() { callsToFailure = 0; }

bool FailingNew::hasFailed() const { return failed; }

} // namespace qelo::test

void* operator new(std::size_t size) {
    if (callsToFailure > 0 && --callsToFailure == 0) {
        failed = true;
        throw std::bad_alloc();
    }
    if (void* memory = std::malloc(size == 0 ? 1 : size)) {
        return memory;
    }
    throw std::bad_alloc();
}

void operator delete(void* memory) noexcept { std::free(memory); }

void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }
