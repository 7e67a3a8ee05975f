// Memory that has held passwords. A password is copied on its way: by strings that grow, by
// buffers of libraries, on the stack. Instead of finding each copy, code that handles passwords
// runs inside forget(): what it frees is wiped before, and the stack that it used is wiped after
// it. Outside of it freeing costs what it always costs.
#pragma once

#include <cstddef>
#include <memory>

namespace qelo::secrecy {

// Whether this thread is inside forget().
bool isForgetting() noexcept;

// malloc(), realloc() and free(), for C libraries that take them: what is freed inside forget() is
// wiped before.
void* allocate(std::size_t size) noexcept;
void* reallocate(void* memory, std::size_t size) noexcept;
void release(void* memory) noexcept;

// free() for libraries that work outside forget(): wipes in any case.
void releaseWiped(void* memory) noexcept;

// Runs `action(data)` as forget() does.
void forgetCall(void (*action)(void*), void* data);

// Runs `action` in this thread. Whatever it frees with `delete` (in programs with
// WipingDelete.cpp) or with release() is wiped, and so is, when it has returned or thrown, the
// stack below the caller. Calls may lie inside each other.
template <class Action> void forget(const Action& action) {
    forgetCall([](void* data) { (*static_cast<const Action*>(data))(); },
               const_cast<Action*>(&action));
}

// Destroys an object inside forget().
struct ForgetfulDelete {
    template <class T> void operator()(T* object) const {
        forget([object] { delete object; });
    }
};
template <class T> using Forgotten = std::unique_ptr<T, ForgetfulDelete>;

} // namespace qelo::secrecy
