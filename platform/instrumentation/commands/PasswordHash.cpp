#include "PasswordHash.h"

#include <crypt.h>

#include <cstdlib>
#include <cstring>
#include <memory>

namespace qelo::store {

namespace {

// The working memory of crypt_ra, which holds the clear text while it runs.
struct CryptMemory {
    void* data = nullptr;
    int size = 0;

    CryptMemory() = default;
    CryptMemory(const CryptMemory&) = delete;
    CryptMemory& operator=(const CryptMemory&) = delete;
    ~CryptMemory() {
        if (data != nullptr) {
            explicit_bzero(data, static_cast<std::size_t>(size));
            std::free(data);
        }
    }
};

} // namespace

Attempt<Secret> hashPassword(const Secret& password) {
    const std::unique_ptr<char, decltype(&std::free)> setting(
        crypt_gensalt_ra(nullptr, 0, nullptr, 0), &std::free);
    if (!setting) {
        return Refusal{"no salt for the password hash"};
    }
    CryptMemory memory;
    const char* hash = crypt_ra(password.text(), setting.get(), &memory.data, &memory.size);
    if (hash == nullptr || hash[0] == '*') {
        return Refusal{"the password cannot be hashed"};
    }
    return Secret(std::string_view(hash));
}

} // namespace qelo::store
