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

// The same end, or none where the request's result class excludes the class there.
inline Target admitted(const AssociationShape& shape, Target end, const char* resultClass) {
    const bool far = end == Target::Far;
    return admitsResultClass(resultClass, far ? shape.farClass : shape.nearClass,
                             far ? shape.farParent : shape.nearParent)
               ? end
               : Target::None;
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
    return wholeOrSaid(lines, forEachPath(paths, status, [&](CMPIObjectPath* path) {
                           visit(path);
                           return true;
                       }));
}

inline bool returnFarInstances(const MarkerLines& lines, const AssociationRequest& request,
                               const CMPIObjectPath* target, CMPIStatus* status) {
    CMPIEnumeration* instances =
        CBEnumInstances(request.broker, request.context, target, nullptr, status);
    if (enumerationFailed(instances, status)) {
        lines.failed(association::enumerationFailed);
        return false;
    }
    const auto give = [&](const CMPIValue& value) {
        if (!isNull(value.inst)) {
            CMReturnInstance(request.result, value.inst);
        }
        return true;
    };
    return wholeOrSaid(lines, forEachElement(instances, CMPI_instance, status, give));
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

// Visits the near paths, about `expected` of them, placed like `ref`; false, with `failedText`
// said, when they cannot be had.
template <class Factory, class Visit>
bool forEachNearPath(const MarkerLines& lines, const AssociationRequest& request,
                     const CMPIObjectPath* ref, Factory& factory, std::size_t expected,
                     const char* failedText, CMPIStatus* status, Visit visit) {
    std::vector<CMPIObjectPath*> paths;
    paths.reserve(expected);
    if (factory.allPaths(request.broker, ref, paths, status) != 0) {
        lines.failed(failedText);
        return false;
    }
    forEachCounted(paths, visit);
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
            return;
        }
        const Target end = admitted(shape, targetOf(shape, target, status), resultClass);
        if ((end == Target::Far && !returnFarInstances(lines, request, target, status)) ||
            (end == Target::Near &&
             !returnNearInstances(lines, request, target, factory, status))) {
            return;
        }
        finish(lines, request.result);
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
            return;
        }
        const auto returnPath = [&](CMPIObjectPath* path) {
            CMReturnObjectPath(request.result, path);
        };
        const Target end = admitted(shape, targetOf(shape, target, status), resultClass);
        if ((end == Target::Far && !forEachFarPath(lines, request, target, status, returnPath)) ||
            (end == Target::Near &&
             !forEachNearPath(lines, request, target, factory, factory.getNumberOfInstances(),
                              association::noNearAssociatorNames, status, returnPath))) {
            return;
        }
        finish(lines, request.result);
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
        const CMPIObjectPath* own =
            newPath(request.broker, request.ref, shape.className, nullptr, status);
        if (targetMissing(lines, target, missingText) || targetMissing(lines, own, missingText)) {
            return;
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
        if (end == Target::Near) {
            typename Association::Factory factory(true, false);
            const auto giveNear = [&](CMPIObjectPath* near) {
                place(near, request.ref, status);
                giveOne(request.ref, near);
            };
            // Not reserved beforehand: asking for the number would be told in lines of its own.
            if (forEachNearPath(lines, request, request.ref, factory, 0,
                                association::noNearReferences, status, giveNear)) {
                finish(lines, request.result);
            }
            return;
        }
        const auto giveFar = [&](CMPIObjectPath* far) { giveOne(far, request.ref); };
        if (end == Target::None || forEachFarPath(lines, request, target, status, giveFar)) {
            finish(lines, request.result);
        }
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
