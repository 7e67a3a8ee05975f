// CIM names compare ignoring case; their hashes make most comparisons one integer long.
#pragma once

#include <cstdint>
#include <string_view>

namespace qelo::broker {

inline unsigned char foldedCase(unsigned char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<unsigned char>(c + ('a' - 'A')) : c;
}

// The same for names that are equal ignoring case.
inline std::uint32_t nameHash(std::string_view name) {
    std::uint32_t hash = 2166136261U;
    for (const char c : name) {
        hash = (hash ^ foldedCase(static_cast<unsigned char>(c))) * 16777619U;
    }
    return hash;
}

} // namespace qelo::broker
