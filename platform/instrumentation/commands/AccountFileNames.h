// The files of the account database, by their names below "etc".
#pragma once

#include <array>

namespace qelo::store {

constexpr const char* kPasswd = "passwd";
constexpr const char* kShadow = "shadow";
constexpr const char* kGroup = "group";
constexpr const char* kGshadow = "gshadow";
constexpr const char* kSubuid = "subuid";
constexpr const char* kSubgid = "subgid";

// In the order in which the system's tools lock them.
constexpr std::array<const char*, 6> kAccountFiles{kPasswd, kGroup,  kGshadow,
                                                   kShadow, kSubuid, kSubgid};

} // namespace qelo::store
