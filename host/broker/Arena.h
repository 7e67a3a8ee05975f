// Memory with one common end: objects are taken from it one by one and given back all
// together when it is destroyed. A provider call takes its objects from one arena, a clone
// lives in one of its own.
//
// Everything placed here is trivially destructible. Allocation is safe from several threads:
// a provider may hand objects of one call to helper threads of its own.
#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <mutex>
#include <new>
#include <string_view>
#include <type_traits>
#include <unordered_map>
#include <utility>

namespace qelo::broker {

struct StringObject;

class Arena {
public:
    // `firstBlock` bytes are fetched at the first allocation; later blocks grow.
    explicit Arena(std::size_t firstBlock = 4096) : nextBlock_(firstBlock) {}

    // One whose names are those of `elder`, which lives longer and is told of the same calls.
    explicit Arena(Arena* elder) : Arena() { elder_ = elder; }
    ~Arena();
    Arena(const Arena&) = delete;
    Arena& operator=(const Arena&) = delete;

    // Ends all objects, but keeps a block for the next ones. Nobody may use it meanwhile.
    void clear();

    // Uninitialised memory for any type; never null. Throws std::bad_alloc.
    void* allocate(std::size_t size);

    template <class T, class... Args> T* make(Args&&... args) {
        static_assert(std::is_trivially_destructible_v<T>, "nobody would run the destructor");
        return new (allocate(sizeof(T))) T{std::forward<Args>(args)...};
    }

    template <class T> T* makeArray(std::size_t count) {
        static_assert(std::is_trivially_copyable_v<T>);
        // Of a pointer, the pointer itself is meant.
        constexpr std::size_t size = sizeof(T); // NOLINT(bugprone-sizeof-expression)
        if (count > SIZE_MAX / size) {
            throw std::bad_alloc();
        }
        return static_cast<T*>(allocate(count * size));
    }

    // The string object of a name, the same one for the same spelling. `hash` is nameHash().
    StringObject* name(std::string_view text, std::uint32_t hash);

    // The most properties that an instance here had so far: the next one is likely to be of
    // the same class and gets room for as many at once.
    std::size_t usualPropertyCount() const {
        return (elder_ != nullptr ? elder_ : this)->propertyCount_.load(std::memory_order_relaxed);
    }
    void notePropertyCount(std::size_t count) {
        if (elder_ != nullptr) {
            elder_->notePropertyCount(count);
            return;
        }
        constexpr std::size_t unusual = 64;
        if (count > usualPropertyCount() && count <= unusual) {
            propertyCount_.store(count, std::memory_order_relaxed);
        }
    }

private:
    struct Block;
    struct NameKey {
        std::string_view text;
        std::uint32_t hash;
        bool operator==(const NameKey& other) const { return text == other.text; }
    };
    struct NameKeyHash {
        std::size_t operator()(const NameKey& key) const { return key.hash; }
    };

    // Where a name was found last; most providers use the same few all the time.
    static constexpr std::size_t recentNames = 64;

    void addBlock(std::size_t size);
    static void freeBlocks(Block* first);
    StringObject* nameFor(Arena& user, std::string_view text, std::uint32_t hash);

    Arena* elder_ = nullptr;
    std::mutex mutex_;
    Block* blocks_ = nullptr;
    std::byte* free_ = nullptr;
    std::byte* end_ = nullptr;
    std::size_t nextBlock_;

    std::atomic<std::size_t> propertyCount_{4};

    std::mutex namesMutex_;
    std::unordered_map<NameKey, StringObject*, NameKeyHash> names_;
    std::array<StringObject*, recentNames> recent_{}; // by hash
};

// A growing sequence whose elements lie in an arena. Copying copies the reference only.
template <class T> class ArenaVector {
public:
    static_assert(std::is_trivially_copyable_v<T>);

    std::size_t size() const { return size_; }
    bool empty() const { return size_ == 0; }
    T* begin() { return data_; }
    T* end() { return data_ + size_; }
    const T* begin() const { return data_; }
    const T* end() const { return data_ + size_; }
    T& operator[](std::size_t index) { return data_[index]; }
    const T& operator[](std::size_t index) const { return data_[index]; }

    void reserve(Arena& arena, std::size_t capacity) {
        if (capacity <= capacity_) {
            return;
        }
        T* bigger = arena.makeArray<T>(capacity);
        for (std::size_t i = 0; i < size_; ++i) {
            new (&bigger[i]) T(data_[i]);
        }
        data_ = bigger;
        capacity_ = capacity;
    }

    void append(Arena& arena, const T& element) {
        if (size_ == capacity_) {
            reserve(arena, capacity_ == 0 ? 4 : capacity_ * 2);
        }
        new (&data_[size_]) T(element);
        ++size_;
    }

    void clear() { size_ = 0; }

private:
    T* data_ = nullptr;
    std::size_t size_ = 0;
    std::size_t capacity_ = 0;
};

} // namespace qelo::broker
