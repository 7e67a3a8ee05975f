// A text that is wiped from memory when it is no longer used: passwords and their hashes.
// It can be moved but not copied, and moving leaves no second copy of the bytes behind.
#pragma once

#include <cstddef>
#include <initializer_list>
#include <memory>
#include <string_view>

namespace qelo::store {

class Secret {
public:
    Secret() = default;
    // The parts one after the other.
    explicit Secret(std::initializer_list<std::string_view> parts);
    explicit Secret(std::string_view text) : Secret({text}) {}
    ~Secret() { wipe(); }
    Secret(Secret&& other) noexcept;
    Secret& operator=(Secret&& other) noexcept;
    Secret(const Secret&) = delete;
    Secret& operator=(const Secret&) = delete;

    bool empty() const { return size_ == 0; }
    std::string_view view() const { return {text(), size_}; }
    // NUL-terminated; valid as long as this object.
    const char* text() const { return bytes_ ? bytes_.get() : ""; }

private:
    void wipe();

    std::unique_ptr<char[]> bytes_;
    std::size_t size_ = 0;
};

} // namespace qelo::store
