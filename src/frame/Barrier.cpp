#include "Barrier.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

CMPIStatus reportEscaped(const CMPIBroker* broker, const UnitTrace& unit, TraceSite site,
                         const char* text) noexcept {
    // An exception may be without a word.
    const char* const told = text != nullptr ? text : "";
    try {
        unit.message(told, TraceLevel::failure, site);
    } catch (...) { // out of memory, most likely; the status still tells
    }
    try {
        return makeStatus(broker, CMPI_RC_ERR_FAILED, told);
    } catch (...) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    }
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
