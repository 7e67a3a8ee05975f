// The seven providers and what each registers.
#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace qelo::test {

struct ProviderKind {
    const char* provider;
    bool methods;
    bool associations;
};

inline void PrintTo(const ProviderKind& kind, std::ostream* stream) { *stream << kind.provider; }

inline const std::vector<ProviderKind>& providerKinds() {
    static const std::vector<ProviderKind> kinds = {
        {"SimAccountProvider", true, false},
        {"SimGroupProvider", true, false},
        {"SimIdentityProvider", false, false},
        {"SimAccountManagementServiceProvider", false, false},
        {"SimAccountManagementCapabilitiesProvider", false, false},
        {"SimAccountHostedServiceProvider", false, true},
        {"SimElementCapabilitiesProvider", false, true},
    };
    return kinds;
}

inline std::vector<ProviderKind> methodProviders() {
    return {providerKinds().begin(), providerKinds().begin() + 2};
}

inline std::vector<ProviderKind> associationProviders() {
    return {providerKinds().end() - 2, providerKinds().end()};
}

// Gives each parameterised test the provider's name.
template <class Info> std::string providerName(const Info& test) { return test.param.provider; }

} // namespace qelo::test
