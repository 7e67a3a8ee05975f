// Invoking a method, as the providers of accounts and groups share it.
#pragma once

#include "BrokerAccess.h"

#include <strings.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Runs `execute()` (true: failed) when the target is of `className`, ignoring case; a method
// of any other class does nothing and succeeds.
template <class Execute>
CMPIStatus executeOn(const char* className, const CMPIBroker* broker, const CMPIObjectPath* ref,
                     Execute execute) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const char* target = classNameOf(ref, &status);
    if (::strcasecmp(target, className) == 0 && execute()) {
        return makeStatus(broker, CMPI_RC_ERR_FAILED, "Execute Method Failed");
    }
    return status;
}

// Gives the result its return value and closes it.
inline void returnUint32(const CMPIResult* result, CMPIUint32 number) {
    CMPIValue value = {};
    value.uint32 = number;
    CMReturnData(result, &value, CMPI_uint32);
    CMReturnDone(result);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
