// Following both associations from one object: associators and references. The description
// of an association is that of AssociationOperations.h.
#pragma once

#include "AssociationOperations.h"

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Which end of the association the objects at the other side of the request's object are.
enum class Target { None, Far, Near };

inline Target targetOf(const AssociationShape& shape, const CMPIObjectPath* target,
                       CMPIStatus* status) {
    const char* name = classNameOf(target, status);
    if (std::strcmp(name, shape.farClass) == 0) {
        return Target::Far;
    }
    return std::strcmp(name, shape.nearClass) == 0 ? Target::Near : Target::None;
}

// Says so when there is no target path.
inline bool targetMissing(const MarkerLines& lines, const CMPIObjectPath* target,
                          const char* text) {
    if (isNull(target)) {
        lines.failed(text);
        return true;
    }
    return false;
}

// Visits the paths that the broker yields for the far class; false when it could not.
template <class Visit>
bool forEachFarPath(const MarkerLines& lines, const AssociationRequest& request,
                    const CMPIObjectPath* target, CMPIStatus* status, Visit visit) {
    CMPIEnumeration* paths = CBEnumInstanceNames(request.broker, request.context, target, status);
    if (enumerationFailed(paths, status)) {
        lines.failed(association::enumerationFailed);
        return false;
    }
    forEachPath(paths, [&](CMPIObjectPath* path) {
        visit(path);
        return true;
    });
    return true;
}

inline bool returnFarInstances(const MarkerLines& lines, const AssociationRequest& request,
                               const CMPIObjectPath* target, CMPIStatus* status) {
    CMPIEnumeration* instances =
        CBEnumInstances(request.broker, request.context, target, nullptr, status);
    if (enumerationFailed(instances, status)) {
        lines.failed(association::enumerationFailed);
        return false;
    }
    forEachElement(instances, CMPI_instance, [&](const CMPIValue& value) {
        if (!isNull(value.inst)) {
            CMReturnInstance(request.result, value.inst);
        }
        return true;
    });
    return true;
}

template <class Factory>
bool returnNearInstances(const MarkerLines& lines, const AssociationRequest& request,
                         const CMPIObjectPath* target, Factory& factory, CMPIStatus* status) {
    std::vector<CMPIInstance*> instances;
    instances.reserve(factory.getNumberOfInstances());
    if (factory.allInstances(request.broker, target, request.properties, false, instances,
                             status) != 0) {
        lines.failed(association::noNearInstances);
        return false;
    }
    deliver(request.result, instances);
    return true;
}

// The near paths for a request; false, with `failedText` said, when they cannot be had.
template <class Factory>
bool collectNearPaths(const MarkerLines& lines, const AssociationRequest& request,
                      const CMPIObjectPath* ref, Factory& factory, const char* failedText,
                      std::vector<CMPIObjectPath*>& paths, CMPIStatus* status) {
    paths.reserve(factory.getNumberOfInstances());
    if (factory.allPaths(request.broker, ref, paths, status) != 0) {
        lines.failed(failedText);
        return false;
    }
    return true;
}

template <class Association>
CMPIStatus associators(const MarkerLines& lines, const AssociationRequest& request,
                       const char* assocClass, const char* resultClass) {
    return associationOperation(lines, request, [&](CMPIStatus* status) {
        const AssociationShape& shape = Association::shape();
        typename Association::Utility utility;
        typename Association::Factory factory(true, false);
        const CMPIObjectPath* target = utility.get_assoc_targetClass_ObjectPath(
            request.broker, request.ref, assocClass, resultClass, status);
        if (targetMissing(lines, target, "Object Path is NULL in Associators.")) {
            return false;
        }
        switch (targetOf(shape, target, status)) {
        case Target::Far:
            return !admitsResultClass(resultClass, shape.farClass, shape.farParent) ||
                   returnFarInstances(lines, request, target, status);
        case Target::Near:
            return !admitsResultClass(resultClass, shape.nearClass, shape.nearParent) ||
                   returnNearInstances(lines, request, target, factory, status);
        case Target::None:
            break;
        }
        return true;
    });
}

template <class Association>
CMPIStatus associatorNames(const MarkerLines& lines, const AssociationRequest& request,
                           const char* assocClass, const char* resultClass) {
    return associationOperation(lines, request, [&](CMPIStatus* status) {
        const AssociationShape& shape = Association::shape();
        typename Association::Utility utility;
        typename Association::Factory factory(true, false);
        const CMPIObjectPath* target = utility.get_assoc_targetClass_ObjectPath(
            request.broker, request.ref, assocClass, resultClass, status);
        if (targetMissing(lines, target, "Object Path is NULL in AssociatorNames.")) {
            return false;
        }
        const auto returnPath = [&](CMPIObjectPath* path) {
            CMReturnObjectPath(request.result, path);
        };
        const Target end = targetOf(shape, target, status);
        if (end == Target::Far && admitsResultClass(resultClass, shape.farClass, shape.farParent)) {
            return forEachFarPath(lines, request, target, status, returnPath);
        }
        if (end == Target::Near &&
            admitsResultClass(resultClass, shape.nearClass, shape.nearParent)) {
            std::vector<CMPIObjectPath*> paths;
            if (!collectNearPaths(lines, request, target, factory,
                                  association::noNearAssociatorNames, paths, status)) {
                return false;
            }
            forEachCounted(paths, returnPath);
        }
        return true;
    });
}

// The instances of the association that touch the request's object, each handed to
// `give(instance)`; what is common to References and ReferenceNames.
template <class Association, class Give>
CMPIStatus eachReference(const MarkerLines& lines, const AssociationRequest& request,
                         const char* resultClass, const char* missingText, Give give) {
    return associationOperation(lines, request, [&](CMPIStatus* status) {
        const AssociationShape& shape = Association::shape();
        typename Association::Utility utility;
        const CMPIObjectPath* target = utility.get_assoc_targetClass_ObjectPath(
            request.broker, request.ref, shape.className, resultClass, status);
        if (targetMissing(lines, target, missingText)) {
            return false;
        }
        CMPIObjectPath* own =
            newPath(request.broker, request.ref, shape.className, nullptr, status);
        if (targetMissing(lines, own, missingText)) {
            return false;
        }
        const auto giveOne = [&](const CMPIObjectPath* far, const CMPIObjectPath* near) {
            CMPIInstance* instance = CMNewInstance(request.broker, own, status);
            if (!isNull(instance)) {
                setReference(instance, shape.farRole, far);
                setReference(instance, shape.nearRole, near);
                give(instance);
            }
        };
        const Target end = targetOf(shape, target, status);
        if (end == Target::Far) {
            return forEachFarPath(lines, request, target, status,
                                  [&](CMPIObjectPath* far) { giveOne(far, request.ref); });
        }
        if (end == Target::Near) {
            typename Association::Factory factory(true, false);
            std::vector<CMPIObjectPath*> paths;
            if (!collectNearPaths(lines, request, request.ref, factory,
                                  association::noNearReferences, paths, status)) {
                return false;
            }
            forEachCounted(paths, [&](CMPIObjectPath* near) {
                setNameSpaceFrom(near, request.ref, status);
                near->ft->setHostname(near, getSystemName().c_str());
                giveOne(request.ref, near);
            });
        }
        return true;
    });
}

template <class Association>
CMPIStatus references(const MarkerLines& lines, const AssociationRequest& request,
                      const char* resultClass) {
    return eachReference<Association>(
        lines, request, resultClass, "Object Path is NULL in References.",
        [&](CMPIInstance* instance) { CMReturnInstance(request.result, instance); });
}

template <class Association>
CMPIStatus referenceNames(const MarkerLines& lines, const AssociationRequest& request,
                          const char* resultClass) {
    return eachReference<Association>(lines, request, resultClass,
                                      "Object Path is NULL in ReferenceNames.",
                                      [&](CMPIInstance* instance) {
                                          CMPIObjectPath* path = CMGetObjectPath(instance, nullptr);
                                          if (!isNull(path)) {
                                              CMReturnObjectPath(request.result, path);
                                          }
                                      });
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
