// The other end of a ZANTH_SimElementCapabilities association.
#pragma once

#include "AssociationShape.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

extern const AssociationShape elementCapabilitiesShape;

// Without state.
class SimElementCapabilitiesObjFactory {
public:
    // The class at the other end, seen from an object of the class of `ref` along the
    // association class `_RefLeftClass`; the empty text when the two do not belong to this
    // association. `_RefRightClass` is only traced. Never null; `rc` may be.
    const char* get_assoc_targetClass_Name(const CMPIBroker* _broker, const CMPIObjectPath* ref,
                                           const char* _RefLeftClass, const char* _RefRightClass,
                                           CMPIStatus* rc);

    // A new path of that class in the namespace of `ref`; null when the broker makes none.
    CMPIObjectPath* get_assoc_targetClass_ObjectPath(const CMPIBroker* _broker,
                                                     const CMPIObjectPath* ref,
                                                     const char* _RefLeftClass,
                                                     const char* _RefRightClass, CMPIStatus* rc);
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
