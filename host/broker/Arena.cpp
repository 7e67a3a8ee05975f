#include "Arena.h"

#include "Objects.h"

#include <algorithm>
#include <memory>

#include <sys/mman.h>

namespace qelo::broker {
namespace {

constexpr std::size_t alignment = alignof(std::max_align_t);
constexpr std::size_t largestGrowth = 4UL * 1024 * 1024;

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
};

Arena::~Arena() {
    while (blocks_) {
        Block* next = blocks_->next;
        ::operator delete(blocks_);
        blocks_ = next;
    }
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
    blocks_ = new (memory) Block{blocks_};
    free_ = static_cast<std::byte*>(memory) + sizeof(Block);
    end_ = free_ + room;
    nextBlock_ = std::min(largestGrowth, nextBlock_ * 2);
}

StringObject* Arena::name(std::string_view text, std::uint32_t hash) {
    std::lock_guard lock(namesMutex_);
    if (auto found = names_.find(NameKey{text, hash}); found != names_.end()) {
        return found->second;
    }
    StringObject* made = newString(*this, text, Ownership::Contained);
    names_.emplace(NameKey{std::string_view(made->text(), made->length), hash}, made);
    return made;
}

} // namespace qelo::broker
