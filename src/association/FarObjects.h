// Asking the broker for the far objects of an association.
#pragma once

#include "../frame/BrokerAccess.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Makes sure that a failed enumeration also says so: true when it failed, `status` then
// being an error. An enumeration that comes back null is a failed one.
inline bool enumerationFailed(const CMPIEnumeration* enumeration, CMPIStatus* status) {
    if (status->rc == CMPI_RC_OK && isNull(enumeration)) {
        *status = {CMPI_RC_ERR_FAILED, nullptr};
    }
    return status->rc != CMPI_RC_OK;
}

// Calls `visit(element)` for each element of that type, in order, until it returns false or
// the enumeration ends. Elements without a value are passed over. False when the enumeration
// failed on the way, `status` then being the broker's: a part is not to pass for the whole.
template <class Visit>
bool forEachElement(const CMPIEnumeration* enumeration, CMPIType type, CMPIStatus* status,
                    Visit visit) {
    CMPIStatus step = {CMPI_RC_OK, nullptr};
    while (enumeration->ft->hasNext(enumeration, &step) != 0 && step.rc == CMPI_RC_OK) {
        const CMPIData element = enumeration->ft->getNext(enumeration, &step);
        if (step.rc != CMPI_RC_OK) {
            break;
        }
        const bool usable =
            element.type == type && (element.state & (CMPI_nullValue | CMPI_badValue)) == 0;
        if (usable && !visit(element.value)) {
            return true;
        }
    }
    if (step.rc != CMPI_RC_OK) {
        *status = step;
        return false;
    }
    return true;
}

// The same for object paths, null ones left out.
template <class Visit>
bool forEachPath(const CMPIEnumeration* enumeration, CMPIStatus* status, Visit visit) {
    return forEachElement(enumeration, CMPI_ref, status, [&](const CMPIValue& value) {
        return isNull(value.ref) || visit(value.ref);
    });
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
