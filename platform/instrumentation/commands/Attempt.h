// Errors as values: how the parts of the command executor say what went wrong.
// A reason is a short text for people. It never holds a password or a hash.
#pragma once

#include <optional>
#include <string>
#include <utility>
#include <variant>

namespace qelo::store {

// Empty when the step was done, else the reason why it was not.
using Problem = std::optional<std::string>;

struct Refusal {
    std::string reason;
};

// A value, or the reason why there is none.
template <typename T> class Attempt {
public:
    Attempt(const T& value) : result_(value) {}
    Attempt(T&& value) : result_(std::move(value)) {}
    Attempt(Refusal refusal) : result_(std::move(refusal)) {}

    explicit operator bool() const { return std::holds_alternative<T>(result_); }
    T& operator*() { return std::get<T>(result_); }
    const T& operator*() const { return std::get<T>(result_); }
    T* operator->() { return &std::get<T>(result_); }
    const T* operator->() const { return &std::get<T>(result_); }

    // Only for an attempt that gave no value.
    const std::string& reason() const { return std::get<Refusal>(result_).reason; }
    Refusal refusal() const { return std::get<Refusal>(result_); }

private:
    std::variant<T, Refusal> result_;
};

} // namespace qelo::store
