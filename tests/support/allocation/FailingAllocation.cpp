#include "FailingAllocation.h"

#include <array>
#include <climits>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <execinfo.h>
#include <link.h>
#include <new>

namespace qelo::test {

namespace {

struct Range {
    std::uintptr_t first = 0;
    std::uintptr_t end = 0;

    bool holds(const void* address) const {
        const auto place = reinterpret_cast<std::uintptr_t>(address);
        return place >= first && place < end;
    }
};

struct Search {
    const char* file;
    Range found;
};

bool sameFile(const char* a, const char* b) {
    std::array<char, PATH_MAX> first{};
    std::array<char, PATH_MAX> second{};
    return realpath(a, first.data()) != nullptr && realpath(b, second.data()) != nullptr &&
           std::strcmp(first.data(), second.data()) == 0;
}

// The addresses of the library's code and data.
int visit(dl_phdr_info* info, std::size_t, void* data) {
    auto& search = *static_cast<Search*>(data);
    if (info->dlpi_name == nullptr || !sameFile(info->dlpi_name, search.file)) {
        return 0;
    }
    search.found.first = info->dlpi_addr;
    for (int i = 0; i < info->dlpi_phnum; ++i) {
        const auto& segment = info->dlpi_phdr[i];
        if (segment.p_type == PT_LOAD) {
            search.found.end = info->dlpi_addr + segment.p_vaddr + segment.p_memsz;
        }
    }
    return 1;
}

Range rangeOf(const char* file) {
    Search search{file, {}};
    dl_iterate_phdr(visit, &search);
    return search.found;
}

Range rangeAround(void* address) {
    Dl_info info{};
    return dladdr(address, &info) != 0 ? rangeOf(info.dli_fname) : Range{};
}

// The blocks that are in use, in the order of their making. In memory of its own, since it is
// called from the operators themselves.
class Ledger {
public:
    ~Ledger() { std::free(blocks_); }

    void clear() { used_ = 0; }
    std::size_t size() const { return used_; }

    void add(void* block) {
        if (used_ == room_) {
            room_ = room_ == 0 ? 1024 : room_ * 2;
            blocks_ = static_cast<void**>(std::realloc(blocks_, room_ * sizeof(void*)));
            if (blocks_ == nullptr) {
                std::abort();
            }
        }
        blocks_[used_++] = block;
    }

    // What was made last is mostly freed first.
    void remove(const void* block) {
        for (std::size_t i = used_; i > 0; --i) {
            if (blocks_[i - 1] == block) {
                std::memmove(blocks_ + i - 1, blocks_ + i, (used_ - i) * sizeof(void*));
                --used_;
                return;
            }
        }
    }

private:
    void** blocks_ = nullptr;
    std::size_t used_ = 0;
    std::size_t room_ = 0;
};

struct Plan {
    bool armed = false;
    bool counting = false;
    bool looking = false; // while the caller is being found out, which may allocate
    std::size_t left = 0;
    bool hit = false;
    Range library;
    Range cxxLibrary;
    Ledger blocks;
};
thread_local Plan plan;

// Whether the library stands behind an allocation that the C++ library makes for its caller.
// `caller` is where the operator returns to; what stands beyond it is on the stack.
bool standsBehind(const void* caller) {
    std::array<void*, 16> frames{};
    const int count = backtrace(frames.data(), static_cast<int>(frames.size()));
    bool beyond = false;
    for (int i = 0; i < count; ++i) {
        const void* frame = frames.at(static_cast<std::size_t>(i));
        beyond = beyond || frame == caller;
        if (beyond && !plan.cxxLibrary.holds(frame)) {
            return plan.library.holds(frame);
        }
    }
    return false;
}

// Whether the allocation is the library's, as far as that is still of interest.
bool counts(const void* caller) {
    if (!plan.armed || plan.looking || (plan.hit && !plan.counting)) {
        return false;
    }
    if (!plan.cxxLibrary.holds(caller)) {
        return plan.library.holds(caller);
    }
    plan.looking = true;
    const bool result = standsBehind(caller);
    plan.looking = false;
    return result;
}

void* allocate(std::size_t size, const void* caller) {
    const bool counted = counts(caller);
    if (counted && !plan.hit && --plan.left == 0) {
        plan.hit = true;
        throw std::bad_alloc();
    }
    void* memory = std::malloc(size == 0 ? 1 : size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    if (counted && plan.counting) {
        plan.blocks.add(memory);
    }
    return memory;
}

void release(void* memory) {
    if (plan.armed && plan.counting) {
        plan.blocks.remove(memory);
    }
    std::free(memory);
}

} // namespace

void FailingAllocation::arm(const std::string& library, std::size_t n) {
    std::array<void*, 1> frame{};
    backtrace(frame.data(), 1); // its first use loads a library
    plan.library = rangeOf(library.c_str());
    plan.cxxLibrary = rangeAround(dlsym(RTLD_DEFAULT, "_ZNSaIcEC1Ev"));
    plan.left = n;
    plan.blocks.clear();
    plan.hit = false;
    plan.armed = true;
}

bool FailingAllocation::disarm() {
    plan.armed = false;
    return plan.hit;
}

void FailingAllocation::countBlocks(bool on) { plan.counting = on; }

std::size_t FailingAllocation::blocksLeft() { return plan.blocks.size(); }

} // namespace qelo::test

// ---- The operators of the whole program

void* operator new(std::size_t size) {
    return qelo::test::allocate(size, __builtin_return_address(0));
}

void* operator new[](std::size_t size) {
    return qelo::test::allocate(size, __builtin_return_address(0));
}

void operator delete(void* memory) noexcept { qelo::test::release(memory); }
void operator delete[](void* memory) noexcept { qelo::test::release(memory); }
void operator delete(void* memory, std::size_t) noexcept { qelo::test::release(memory); }
void operator delete[](void* memory, std::size_t) noexcept { qelo::test::release(memory); }
