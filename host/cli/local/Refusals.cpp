#include "Refusals.h"

#include <commands/AdminCommand.h>
#include <logging/LogListener.h>

#include <cstring>
#include <exception>

// An agent's own logging library need not have it.
#pragma weak qelo_setLogListener

namespace qelo::cli {
namespace {

std::string& lastReason() {
    static std::string reason;
    return reason;
}

void listen(void* reason, const char* component, int, const char* message) {
    const std::size_t prefix = std::strlen(store::kRefusalPrefix);
    if (std::strcmp(component, store::kCommandComponent) != 0 ||
        std::strncmp(message, store::kRefusalPrefix, prefix) != 0) {
        return;
    }
    try {
        *static_cast<std::string*>(reason) = message + prefix;
    } catch (const std::exception&) {
        // The log still has it.
    }
}

} // namespace

RefusalReason overhearRefusals() {
    if (qelo_setLogListener != nullptr) {
        qelo_setLogListener(listen, &lastReason());
    }
    return [] { return lastReason(); };
}

} // namespace qelo::cli
