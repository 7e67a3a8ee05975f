// How an association class describes itself to the operations that both share
// (AssociationOperations.h). An association ties a far object, which another provider
// serves and the broker is asked for, to a near one, which a factory of this provider makes.
#pragma once

#include "../frame/BrokerAccess.h"

#include <UnitTrace.h>

#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

struct AssociationShape {
    const char* className;
    const char* farClass;
    const char* farRole;
    const char* nearClass;
    const char* nearRole;

    // The standard parents of the two classes, which a result class may name instead; both
    // null where result classes are not looked at.
    const char* farParent;
    const char* nearParent;

    // What is said when the far class's path, or the association's own, cannot be made; the
    // latter differs in a full stop between building instances and enumerating names.
    const char* farPathFailed;
    const char* ownPathFailed;
    const char* ownNameFailed;
};

// The texts that both associations use, blanks and wording as clients of the log know them.
namespace association {
constexpr const char* enumerationFailed = "CBEnumInstanceNames Failed for the target Class";
constexpr const char* nullPath = "CMPIObjectPath is NULL";
constexpr const char* noNearPaths =
    "***Can't get ObjectPaths.                 Exiting EnumerateInstanceNames***";
constexpr const char* noNearNames =
    "***Can't get ObjectPaths.                Exiting EnumerateInstanceNames***";
constexpr const char* noNearInstances =
    "***Can't get ObjectPaths.                  Exiting Associators***";
constexpr const char* noNearAssociatorNames =
    "***Can't get Service processor ObjectPaths.                     Exiting AssociatorNames***";
constexpr const char* noNearReferences =
    "***Can't get instances                 Exiting References***";
} // namespace association

// The class at the other end, seen from an object of the class of `ref` along the association
// class `_RefLeftClass`: the far class, the near class, or the empty text when the two do not
// belong to the association. `_RefRightClass` is only traced.
const char* associationTargetName(const UnitTrace& unit, const AssociationShape& shape,
                                  const CMPIBroker* _broker, const CMPIObjectPath* ref,
                                  const char* _RefLeftClass, const char* _RefRightClass,
                                  CMPIStatus* rc);

// A new path of that class, placed like `ref`; null when the broker makes none, `rc` then
// saying why.
CMPIObjectPath* associationTargetPath(const UnitTrace& unit, const AssociationShape& shape,
                                      const CMPIBroker* _broker, const CMPIObjectPath* ref,
                                      const char* _RefLeftClass, const char* _RefRightClass,
                                      CMPIStatus* rc);

// Whether a result class admits objects of `className`: none is named, or that class or its
// parent is, ignoring case. An association without parents looks at no result class.
bool admitsResultClass(const char* resultClass, const char* className, const char* parent);

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
