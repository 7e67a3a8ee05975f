// The operators new and delete of the whole program, its libraries and providers included. For
// programs that handle passwords, see Forget.h.
#include "Forget.h"

#include <cstdlib>
#include <new>

// Visible for the libraries, which take those of the program then.
#define QELO_FOR_ALL __attribute__((visibility("default")))

QELO_FOR_ALL void* operator new(std::size_t size) {
    for (;;) {
        if (void* const memory = std::malloc(size == 0 ? 1 : size)) {
            return memory;
        }
        const std::new_handler handler = std::get_new_handler();
        if (handler == nullptr) {
            throw std::bad_alloc();
        }
        handler();
    }
}

QELO_FOR_ALL void operator delete(void* memory) noexcept { qelo::secrecy::release(memory); }

QELO_FOR_ALL void operator delete(void* memory, std::size_t) noexcept {
    qelo::secrecy::release(memory);
}
