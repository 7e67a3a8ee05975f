// What the fuzz targets have in common.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

namespace qelo::fuzz {

// Ends the process where something does not hold: that is what a finding is.
inline void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

inline std::string_view viewOf(const std::uint8_t* data, std::size_t size) {
    return {reinterpret_cast<const char*>(data), size};
}

// Takes the part before the first `separator` from the front of `text`; all of it where there
// is none. Lets one input hold several texts.
inline std::string_view takePart(std::string_view& text, char separator) {
    const std::size_t end = text.find(separator);
    const std::string_view part = text.substr(0, end);
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
    return part;
}

inline bool contains(std::string_view text, std::string_view part) {
    return text.find(part) != std::string_view::npos;
}

} // namespace qelo::fuzz
