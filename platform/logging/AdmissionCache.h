// What one thread remembers of the thresholds, so that a line that is not admitted is turned
// away without a lock.
#pragma once

#include "logging/LoggerCore.h"

#include <array>
#include <cstdint>
#include <cstring>
#include <string>

namespace qelo::logging {

// Whether two texts of the same size are equal. In place, and by 16 characters at once: for
// names this short a call of memcmp() costs more than the comparison.
inline bool sameCharacters(const char* left, const char* right, std::size_t size) {
    constexpr std::size_t step = 16;
    if (size < step) {
        return std::memcmp(left, right, size) == 0;
    }
    std::size_t at = 0;
    for (; at + step < size; at += step) {
        if (std::memcmp(left + at, right + at, step) != 0) {
            return false;
        }
    }
    at = size - step; // the last part may overlap the one before
    return std::memcmp(left + at, right + at, step) == 0;
}

// For one thread only. An aggregate of plain values: a thread_local one needs no construction
// and no destruction, so it serves before main and while its thread ends.
struct AdmissionCache {
    // How many lines may be turned away before the configuration file is looked at.
    static constexpr std::uint32_t kLinesPerCheck = 64;

    static constexpr unsigned kSlotBits = 6;
    static constexpr std::size_t kLongestName = 64;

    struct Slot {
        std::uint32_t generation; // 0: empty
        std::uint32_t size;
        std::array<Threshold, kChannels> thresholds;
        std::array<char, kLongestName> name;

        bool holds(const std::string& component, std::uint32_t current) const {
            return generation == current && size == component.size() &&
                   sameCharacters(name.data(), component.data(), component.size());
        }
    };

    // The two neighbouring slots that may hold a component. Component names seldom move, so
    // their addresses spread them well; the characters decide.
    struct Pair {
        Slot& newer;
        Slot& older;
    };

    Pair pairOf(const std::string& component) {
        const auto address = reinterpret_cast<std::uintptr_t>(component.data());
        const std::uint64_t first =
            (static_cast<std::uint64_t>(address) * 0x9E3779B97F4A7C15U) >> (64 - kSlotBits);
        return {slots[first & ~std::uint64_t{1}], slots[first | 1]};
    }

    // Whether a line is turned away whatever its component. False says nothing: isAdmitted()
    // has to be asked. Never throws, and leaves errno alone.
    bool turnsAway(const LoggerCore& core, Channel channel, int level) {
        if (linesToCheck == 0 || level >= core.lowestThreshold(channel)) {
            return false;
        }
        --linesToCheck;
        return true;
    }

    std::uint32_t linesToCheck;
    std::array<Slot, std::size_t{1} << kSlotBits> slots;
};

// Whether `core` admits a line of this level. Looks at the configuration file now and then.
// Throws std::bad_alloc, and only where the answer is not in the cache.
bool isAdmitted(LoggerCore& core, AdmissionCache& cache, Channel channel,
                const std::string& component, int level);

} // namespace qelo::logging
