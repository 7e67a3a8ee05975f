// Where a server listens, as text: "127.0.0.1:5988", "[::1]:5989", or an address alone.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace qelo::cli {

struct ListenAddress {
    std::string address;               // numeric, without brackets
    std::optional<std::uint16_t> port; // nothing: the usual one

    // "[::1]:5988"; with `port` where this has none.
    std::string text(std::uint16_t otherPort) const;
};

// Nothing for a text of another form. Whether the address is one is not looked at.
std::optional<ListenAddress> parseListenAddress(const std::string& text);

} // namespace qelo::cli
