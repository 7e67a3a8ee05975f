#include "FailingAllocation.h"

#include <algorithm>
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

constexpr std::size_t kMostLibraries = 8;

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

using Ranges = std::array<Range, kMostLibraries>;

// Where these files are loaded. Libraries under test stay where they are, and one sweep asks
// for the same ones over and over.
const Ranges& rangesOf(const FailingAllocation::Files& files) {
    static thread_local FailingAllocation::Files known;
    static thread_local Ranges ranges;
    if (known != files) {
        ranges = {};
        for (std::size_t i = 0; i < files.size(); ++i) {
            ranges[i] = rangeOf(files[i].c_str());
            if (ranges[i].end == 0) {
                std::abort(); // not loaded, so that nothing of it would count
            }
        }
        known = files;
    }
    return ranges;
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
    bool looking = false;    // while the caller is being found out, which may allocate
    std::size_t reached = 0; // allocations of the libraries
    std::size_t failing = 0; // the one that fails; 0 is none
    bool hit = false;
    Ranges libraries;
    Range cxxLibrary;
    Ledger blocks;

    bool concerns(const void* address) const {
        return std::any_of(libraries.begin(), libraries.end(),
                           [&](const Range& library) { return library.holds(address); });
    }
};
thread_local Plan plan;

// Whether one of the libraries stands behind an allocation that the C++ library makes for its
// caller. `caller` is where the operator returns to; what stands beyond it is on the stack.
bool standsBehind(const void* caller) {
    std::array<void*, 16> frames{};
    const int count = backtrace(frames.data(), static_cast<int>(frames.size()));
    bool beyond = false;
    for (int i = 0; i < count; ++i) {
        const void* frame = frames.at(static_cast<std::size_t>(i));
        beyond = beyond || frame == caller;
        if (beyond && !plan.cxxLibrary.holds(frame)) {
            return plan.concerns(frame);
        }
    }
    return false;
}

// Whether the allocation is one of the libraries', as far as that is still of interest.
bool counts(const void* caller) {
    if (!plan.armed || plan.looking || (plan.hit && !plan.counting)) {
        return false;
    }
    if (!plan.cxxLibrary.holds(caller)) {
        return plan.concerns(caller);
    }
    plan.looking = true;
    const bool result = standsBehind(caller);
    plan.looking = false;
    return result;
}

void* allocate(std::size_t size, const void* caller) {
    const bool counted = counts(caller);
    plan.reached += counted && !plan.hit ? 1 : 0;
    if (counted && !plan.hit && plan.reached == plan.failing) {
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

void FailingAllocation::arm(const std::string& library, std::size_t n) { arm(Files{library}, n); }

void FailingAllocation::arm(const Files& libraries, std::size_t n) {
    std::array<void*, 1> frame{};
    backtrace(frame.data(), 1); // its first use loads a library
    if (libraries.size() > kMostLibraries) {
        std::abort();
    }
    static const Range cxxLibrary = rangeAround(dlsym(RTLD_DEFAULT, "_ZNSaIcEC1Ev"));
    plan.cxxLibrary = cxxLibrary;
    plan.libraries = rangesOf(libraries);
    plan.failing = n;
    plan.reached = 0;
    plan.blocks.clear();
    plan.hit = false;
    plan.armed = true;
}

bool FailingAllocation::stopFailing() {
    plan.failing = 0;
    return plan.hit;
}

std::size_t FailingAllocation::reached() { return plan.reached; }

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
