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
// the enumeration ends or fails. Elements without a value are passed over.
template <class Visit>
void forEachElement(const CMPIEnumeration* enumeration, CMPIType type, Visit visit) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    while (enumeration->ft->hasNext(enumeration, &status) != 0 && status.rc == CMPI_RC_OK) {
        const CMPIData element = enumeration->ft->getNext(enumeration, &status);
        if (status.rc != CMPI_RC_OK) {
            return;
        }
        const bool usable =
            element.type == type && (element.state & (CMPI_nullValue | CMPI_badValue)) == 0;
        if (usable && !visit(element.value)) {
            return;
        }
    }
}

// The same for object paths, null ones left out.
template <class Visit> void forEachPath(const CMPIEnumeration* enumeration, Visit visit) {
    forEachElement(enumeration, CMPI_ref,
                   [&](const CMPIValue& value) { return isNull(value.ref) || visit(value.ref); });
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
