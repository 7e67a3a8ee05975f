#include "Arena.h"

#include "Objects.h"

#include <algorithm>
#include <memory>
#include <utility>

#include <sys/mman.h>

namespace qelo::broker {
namespace {

constexpr std::size_t alignment = alignof(std::max_align_t);
constexpr std::size_t largestGrowth = 4UL * 1024 * 1024;
constexpr std::size_t largestKept = 256UL * 1024;

// A provider that makes up ever new names must not fill the memory of a whole call with them.
constexpr std::size_t mostSharedNames = 4096;

std::size_t roundUp(std::size_t size) {
    if (size > SIZE_MAX - alignment) {
        throw std::bad_alloc();
    }
    return (size + alignment - 1) / alignment * alignment;
}

// Large blocks are filled from front to back, so that they are cheaper by large pages than by a
// fault for each small one. Only asked for: what the system makes of it does not matter.
void preferLargePages(void* memory, std::size_t size) {
    constexpr std::size_t largePage = 2UL * 1024 * 1024;
    void* first = memory;
    if (std::align(largePage, largePage, first, size) != nullptr) {
        (void)::madvise(first, size / largePage * largePage, MADV_HUGEPAGE);
    }
}

} // namespace

struct alignas(std::max_align_t) Arena::Block {
    Block* next;
    std::size_t room; // behind this header

    std::byte* begin() { return reinterpret_cast<std::byte*>(this + 1); }
};

Arena::~Arena() { freeBlocks(blocks_); }

void Arena::freeBlocks(Block* first) {
    while (first != nullptr) {
        Block* next = first->next;
        ::operator delete(first);
        first = next;
    }
}

void Arena::clear() {
    names_.clear();
    recent_ = {};
    // The latest block is the largest: a level that is opened again and again soon needs no other.
    Block* kept = blocks_ != nullptr && blocks_->room <= largestKept ? blocks_ : nullptr;
    freeBlocks(kept != nullptr ? std::exchange(kept->next, nullptr) : blocks_);
    blocks_ = kept;
    free_ = kept != nullptr ? kept->begin() : nullptr;
    end_ = kept != nullptr ? free_ + kept->room : nullptr;
}

void* Arena::allocate(std::size_t size) {
    const std::size_t rounded = roundUp(std::max<std::size_t>(size, 1));
    std::lock_guard lock(mutex_);
    if (static_cast<std::size_t>(end_ - free_) < rounded) {
        addBlock(rounded);
    }
    void* place = free_;
    free_ += rounded;
    return place;
}

void Arena::addBlock(std::size_t size) {
    const std::size_t room = std::max(size, nextBlock_);
    if (room > SIZE_MAX - sizeof(Block)) {
        throw std::bad_alloc();
    }
    void* memory = ::operator new(sizeof(Block) + room);
    preferLargePages(memory, sizeof(Block) + room);
    blocks_ = new (memory) Block{blocks_, room};
    free_ = blocks_->begin();
    end_ = free_ + room;
    nextBlock_ = std::min(largestGrowth, nextBlock_ * 2);
}

StringObject* Arena::name(std::string_view text, std::uint32_t hash) {
    if (elder_ != nullptr) {
        return elder_->nameFor(*this, text, hash);
    }
    return nameFor(*this, text, hash);
}

// The name from the table, which is made in here; where that is full, one made in `user`.
StringObject* Arena::nameFor(Arena& user, std::string_view text, std::uint32_t hash) {
    std::lock_guard lock(namesMutex_);
    StringObject*& recent = recent_[hash % recentNames];
    if (recent != nullptr && recent->view() == text) {
        return recent;
    }
    if (const auto found = names_.find(NameKey{text, hash}); found != names_.end()) {
        return recent = found->second;
    }
    if (&user != this && names_.size() >= mostSharedNames) {
        return newString(user, text, Ownership::Contained);
    }
    StringObject* made = newString(*this, text, Ownership::Contained);
    names_.emplace(NameKey{made->view(), hash}, made);
    return recent = made;
}

} // namespace qelo::broker
