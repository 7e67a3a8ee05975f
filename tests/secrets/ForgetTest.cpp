#include <secrecy/Forget.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <fcntl.h>
#include <memory>
#include <stdexcept>
#include <string>
#include <thread>
#include <unistd.h>

namespace qelo::secrecy {
namespace {

TEST(Forget, Lasts_until_the_action_returns_or_throws) {
    EXPECT_FALSE(isForgetting());
    forget([] {
        forget([] { EXPECT_TRUE(isForgetting()); });
        EXPECT_TRUE(isForgetting());
    });
    EXPECT_FALSE(isForgetting());
    EXPECT_THROW(forget([] { throw std::runtime_error("x"); }), std::runtime_error);
    EXPECT_FALSE(isForgetting());
}

TEST(Forget, Other_threads_go_on_as_they_are) {
    forget([] { std::thread([] { EXPECT_FALSE(isForgetting()); }).join(); });
}

TEST(Forget, Memory_that_moves_keeps_its_content) {
    forget([] {
        void* memory = reallocate(nullptr, 10);
        std::memcpy(memory, "0123456789", 10);
        memory = reallocate(memory, 100'000);
        EXPECT_EQ(std::memcmp(memory, "0123456789", 10), 0);
        memory = reallocate(memory, 5);
        EXPECT_EQ(std::memcmp(memory, "01234", 5), 0);
        release(memory);
        release(nullptr);
    });
}

TEST(Forget, What_a_forgotten_object_frees_is_freed_inside) {
    struct Watcher {
        bool& inside;
        explicit Watcher(bool& flag) : inside(flag) {}
        ~Watcher() { inside = isForgetting(); }
    };
    bool inside = false;
    { const Forgotten<Watcher> watcher(new Watcher(inside)); }
    EXPECT_TRUE(inside);
}

constexpr std::size_t kDeep = 200'000;

// How many of the bytes at a place, which need not be anybody's any more, are an "x". Takes no
// memory itself, which might be just that.
std::size_t crossesAt(std::uintptr_t place, std::size_t size) {
    static char bytes[kDeep];
    const int memory = open("/proc/self/mem", O_RDONLY | O_CLOEXEC);
    EXPECT_EQ(pread(memory, bytes, size, static_cast<off_t>(place)), static_cast<ssize_t>(size));
    close(memory);
    return static_cast<std::size_t>(std::count(bytes, bytes + size, 'x'));
}

// Numbers and addresses that were written since have some, too.
constexpr std::size_t kByChance = 100;

// Writes crosses into the stack; the result is where.
__attribute__((noinline)) std::uintptr_t crossStack() {
    volatile char deep[kDeep];
    for (volatile char& c : deep) {
        c = 'x';
    }
    // Volatile, since compilers warn of addresses that are of no use any more. This one is.
    volatile auto place = reinterpret_cast<std::uintptr_t>(&deep[0]);
    return place;
}

__attribute__((noinline)) std::uintptr_t crossHeap() {
    const auto text = std::make_unique<std::string>(1000, 'x');
    return reinterpret_cast<std::uintptr_t>(text->data());
}

TEST(Forget, The_stack_is_wiped_as_deep_as_it_was) {
    std::thread([] {
        EXPECT_GT(crossesAt(crossStack(), kDeep), kDeep / 2) << "it stays otherwise";
        std::uintptr_t place = 0;
        forget([&place] { place = crossStack(); });
        EXPECT_LT(crossesAt(place, kDeep), kByChance);
        EXPECT_THROW(forget([&place] {
                         place = crossStack();
                         throw std::runtime_error("x");
                     }),
                     std::runtime_error);
        EXPECT_LT(crossesAt(place, kDeep), kByChance);
    }).join();
}

TEST(Forget, What_is_deleted_is_wiped) {
    EXPECT_GT(crossesAt(crossHeap(), 1000), 500U) << "it stays otherwise";
    std::uintptr_t place = 0;
    forget([&place] { place = crossHeap(); });
    EXPECT_LT(crossesAt(place, 1000), kByChance);
}

} // namespace
} // namespace qelo::secrecy
