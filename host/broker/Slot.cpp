#include "Slot.h"

#include "Frame.h"

#include <client/Connection.h>

#include <new>

namespace qelo::broker {
namespace {

CMPIStatus failure(CMPIrc code, std::string_view text) noexcept {
    CMPIStatus status = {code, nullptr};
    if (text.empty()) {
        return status;
    }
    try {
        status.msg = &newString(currentArena(), text, Ownership::Call)->cmpi;
    } catch (...) {
        // No memory for the message: the code alone must do.
    }
    return status;
}

} // namespace

CMPIStatus currentFailure() noexcept {
    try {
        throw;
    } catch (const Refusal& refusal) {
        return failure(refusal.code, refusal.text);
    } catch (const client::CimError& error) {
        return failure(static_cast<CMPIrc>(error.code()), error.what());
    } catch (const std::bad_alloc&) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    } catch (const std::exception& error) {
        return failure(CMPI_RC_ERR_FAILED, error.what());
    } catch (...) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    }
}

CMPIData absentData() {
    CMPIData data = {};
    data.type = CMPI_null;
    data.state = CMPI_nullValue | CMPI_notFound;
    return data;
}

std::string_view givenName(const char* name) {
    if (!name || !*name) {
        throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
    }
    return name;
}

} // namespace qelo::broker
