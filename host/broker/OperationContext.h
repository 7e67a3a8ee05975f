// What travels with a request beside its arguments: who asks, in which role and language.
// A provider reads it from its CMPIContext, and an up-call hands it on.
#pragma once

#include <cstdint>
#include <string>

namespace qelo::broker {

struct OperationContext {
    // The authenticated user; empty: nobody.
    std::string principal;
    std::string role;
    // As the HTTP headers of these names spell them; empty: not known.
    std::string acceptLanguage;
    std::string contentLanguage;
    // CMPI_FLAG_ bits.
    std::uint32_t invocationFlags = 0;
};

} // namespace qelo::broker
