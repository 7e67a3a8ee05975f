#include "LoginCache.h"

#include <gnutls/crypto.h>
#include <gnutls/gnutls.h>

#include <stdexcept>

namespace qelo::server {
namespace {

void require(int result, const char* what) {
    if (result < 0) {
        throw std::runtime_error(std::string(what) + ": " + gnutls_strerror(result));
    }
}

} // namespace

LoginCache::LoginCache(Clock::duration lifetime, std::size_t capacity)
    : lifetime_(lifetime), capacity_(capacity) {
    require(gnutls_rnd(GNUTLS_RND_KEY, key_.data(), key_.size()), "no random numbers");
}

LoginCache::Digest LoginCache::digestOf(const std::string& user,
                                        const std::string& password) const {
    // The length of the name keeps "ab"+"c" and "a"+"bc" apart.
    std::string text = std::to_string(user.size()) + ":" + user;
    text.reserve(text.size() + password.size()); // so that appending leaves no copy
    text += password;
    Digest digest{};
    const int result = gnutls_hmac_fast(GNUTLS_MAC_SHA256, key_.data(), key_.size(), text.data(),
                                        text.size(), digest.data());
    gnutls_memset(text.data(), 0, text.size());
    require(result, "no digest");
    return digest;
}

bool LoginCache::knows(const std::string& user, const std::string& password) const {
    const std::lock_guard<std::mutex> lock(mutex_);
    const auto found = entries_.find(user);
    if (found == entries_.end() || Clock::now() >= found->second.until) {
        return false;
    }
    const Digest digest = digestOf(user, password);
    return gnutls_memcmp(digest.data(), found->second.digest.data(), digest.size()) == 0;
}

void LoginCache::remember(const std::string& user, const std::string& password) {
    const Digest digest = digestOf(user, password);
    const std::lock_guard<std::mutex> lock(mutex_);
    if (entries_.size() >= capacity_ && entries_.count(user) == 0) {
        entries_.clear(); // costs each user one slow login
    }
    entries_[user] = {digest, Clock::now() + lifetime_};
}

} // namespace qelo::server
