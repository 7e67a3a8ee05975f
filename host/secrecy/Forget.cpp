#include "Forget.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>

#include <malloc.h>
#include <pthread.h>
#include <sys/mman.h>
#include <unistd.h>

namespace qelo::secrecy {
namespace {

// A plain number: it is asked for at every deletion, and must not need a constructor.
thread_local unsigned depth = 0;

// What remains of the page that the stack pointer is in, and one more.
constexpr std::size_t kNearby = 8192;

struct Range {
    char* begin = nullptr;
    char* end = nullptr;
};

// The stack of this thread. That of the first thread grows, so that its size is no help.
Range stackOfThread() {
    pthread_attr_t attributes;
    if (::gettid() == ::getpid() || pthread_getattr_np(pthread_self(), &attributes) != 0) {
        return {};
    }
    void* begin = nullptr;
    std::size_t size = 0;
    const int result = pthread_attr_getstack(&attributes, &begin, &size);
    pthread_attr_destroy(&attributes);
    char* const first = static_cast<char*>(begin);
    return result == 0 ? Range{first, first + size} : Range{};
}

__attribute__((noinline)) void wipeNearby() {
    char memory[kNearby];
    explicit_bzero(memory, sizeof memory);
}

// All pages of the stack below this frame go back to the system, however deep it has been. They
// come again, with zeros, when they are needed.
__attribute__((noinline)) void wipeStackBelow() {
    const Range stack = stackOfThread();
    const auto begin = reinterpret_cast<std::uintptr_t>(stack.begin);
    const auto end = reinterpret_cast<std::uintptr_t>(stack.end);
    const auto here = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
    const auto page = static_cast<std::uintptr_t>(sysconf(_SC_PAGESIZE));
    const std::uintptr_t unused = (here - kNearby / 2) / page * page;
    if (begin < unused && here < end) {
        ::madvise(stack.begin, unused - begin, MADV_DONTNEED);
    }
    wipeNearby();
}

class Forgetting {
public:
    Forgetting() { ++depth; }
    ~Forgetting() {
        --depth;
        wipeStackBelow();
    }
    Forgetting(const Forgetting&) = delete;
    Forgetting& operator=(const Forgetting&) = delete;
};

} // namespace

bool isForgetting() noexcept { return depth != 0; }

void* allocate(std::size_t size) noexcept { return std::malloc(size); }

void* reallocate(void* memory, std::size_t size) noexcept {
    if (memory == nullptr || !isForgetting()) {
        return std::realloc(memory, size);
    }
    // The library would free the old place as it is.
    void* const moved = std::malloc(size);
    if (moved != nullptr) {
        std::memcpy(moved, memory, std::min(size, ::malloc_usable_size(memory)));
        release(memory);
    }
    return moved;
}

void release(void* memory) noexcept {
    if (isForgetting()) {
        releaseWiped(memory);
    } else {
        std::free(memory);
    }
}

void releaseWiped(void* memory) noexcept {
    if (memory != nullptr) {
        explicit_bzero(memory, ::malloc_usable_size(memory));
    }
    std::free(memory);
}

__attribute__((noinline)) void forgetCall(void (*action)(void*), void* data) {
    const Forgetting forgetting;
    action(data);
}

} // namespace qelo::secrecy
