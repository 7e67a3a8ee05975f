// CIM names as keys of maps.
#pragma once

#include <string>
#include <string_view>

namespace qelo::schema {

// The same text for names that are equal ignoring case.
inline std::string foldedName(std::string_view name) {
    std::string folded(name);
    for (char& c : folded) {
        if (c >= 'A' && c <= 'Z') {
            c = static_cast<char>(c + ('a' - 'A'));
        }
    }
    return folded;
}

// A namespace without slashes at its ends, folded.
inline std::string foldedNameSpace(std::string_view nameSpace) {
    const std::size_t first = nameSpace.find_first_not_of('/');
    if (first == std::string_view::npos) {
        return {};
    }
    return foldedName(nameSpace.substr(first, nameSpace.find_last_not_of('/') + 1 - first));
}

} // namespace qelo::schema
