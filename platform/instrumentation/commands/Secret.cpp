#include "Secret.h"

#include <cstring>
#include <utility>

namespace qelo::store {

Secret::Secret(std::initializer_list<std::string_view> parts) {
    for (const std::string_view part : parts) {
        size_ += part.size();
    }
    bytes_ = std::make_unique<char[]>(size_ + 1);
    char* end = bytes_.get();
    for (const std::string_view part : parts) {
        std::memcpy(end, part.data(), part.size());
        end += part.size();
    }
}

Secret::Secret(Secret&& other) noexcept
    : bytes_(std::move(other.bytes_)), size_(std::exchange(other.size_, 0)) {}

Secret& Secret::operator=(Secret&& other) noexcept {
    if (this != &other) {
        wipe();
        bytes_ = std::move(other.bytes_);
        size_ = std::exchange(other.size_, 0);
    }
    return *this;
}

void Secret::wipe() {
    if (bytes_) {
        explicit_bzero(bytes_.get(), size_);
    }
}

} // namespace qelo::store
