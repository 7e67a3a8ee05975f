// The operations of both associations, written once. An association describes itself by a
// type `Association` with
//   shape()             its AssociationShape
//   Factory             the factory of the near objects
//   Utility             the class with get_assoc_targetClass_ObjectPath
//   build               buildInstances under the association's own name
// Every pair of a far and a near object is associated; far objects come outermost. A failed
// step says so in a line and ends the operation with the status that it left.
#pragma once

#include "AssociationShape.h"
#include "FarObjects.h"

#include "../frame/InstanceOperations.h"

#include <platform/TeskCommon.h>

#include <cstring>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// One request as the association operations see it.
struct AssociationRequest {
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* ref;
    const char** properties;
};

inline void setReference(CMPIInstance* instance, const char* role, const CMPIObjectPath* path) {
    CMPIValue value = {};
    value.ref = const_cast<CMPIObjectPath*>(path); // the interface knows no const reference
    instance->ft->setProperty(instance, role, &value, CMPI_ref);
}

inline void addReferenceKey(CMPIObjectPath* own, const char* role, CMPIObjectPath* path) {
    CMPIValue value = {};
    value.ref = path;
    own->ft->addKey(own, role, &value, CMPI_ref);
}

// Passes on whether an enumeration came whole, and says so when it did not.
inline bool wholeOrSaid(const MarkerLines& lines, bool whole) {
    if (!whole) {
        lines.failed(association::enumerationFailed);
    }
    return whole;
}

// Visits every pair of a far path and one of the factory's near paths, far ones outermost,
// until `visit(far, near)` returns false. `noNear` is said when the near paths cannot be had.
// Returns false when a step failed; `status` is then what it left.
template <class Factory, class Visit>
bool forEachPair(const MarkerLines& lines, const AssociationRequest& request,
                 const AssociationShape& shape, Factory& factory, const char* noNear,
                 CMPIStatus* status, Visit visit) {
    // Only its class and namespace count: it names a class to enumerate, not an object.
    CMPIObjectPath* farClass =
        newBarePath(request.broker, request.ref, shape.farClass, nullptr, status);
    if (farClass == nullptr) {
        lines.failed(shape.farPathFailed);
        return false;
    }
    CMPIEnumeration* farPaths =
        CBEnumInstanceNames(request.broker, request.context, farClass, status);
    if (enumerationFailed(farPaths, status)) {
        lines.failed(association::enumerationFailed);
        return false;
    }
    bool going = true;
    const bool whole = forEachPath(farPaths, status, [&](CMPIObjectPath* far) {
        std::vector<CMPIObjectPath*> nearPaths;
        if (factory.allPaths(request.broker, request.ref, nearPaths, status) != 0) {
            lines.failed(noNear);
            return going = false;
        }
        const auto count = static_cast<std::uint16_t>(nearPaths.size());
        for (std::uint16_t i = 0; i < count && going; ++i) {
            CMPIObjectPath* near = nearPaths.at(i);
            if (isNull(near)) {
                lines.failed(association::nullPath);
                return going = false;
            }
            going = visit(far, near);
        }
        return going;
    });
    return wholeOrSaid(lines, whole) && going;
}

// A new path of the association's own class, or null with the failure said.
template <class Association>
CMPIObjectPath* ownPath(const MarkerLines& lines, const AssociationRequest& request,
                        const char* failedText, CMPIStatus* status) {
    CMPIObjectPath* path =
        newPath(request.broker, request.ref, Association::shape().className, nullptr, status);
    if (path == nullptr) {
        lines.failed(failedText);
    }
    return path;
}

// Builds every association instance; returns false when a step failed.
template <class Association>
bool buildInstances(const MarkerLines& lines, const AssociationRequest& request,
                    std::vector<CMPIInstance*>& instances, CMPIStatus* status) {
    const AssociationShape& shape = Association::shape();
    typename Association::Factory factory(true, false);
    const auto build = [&](CMPIObjectPath* far, CMPIObjectPath* near) {
        CMPIObjectPath* own = ownPath<Association>(lines, request, shape.ownPathFailed, status);
        if (own == nullptr) {
            return false;
        }
        CMPIStatus aside = succeeded; // one that cannot be made is left out, and that is all
        CMPIInstance* instance = CMNewInstance(request.broker, own, &aside);
        if (!isNull(instance)) {
            const char* keys[] = {shape.farRole, shape.nearRole, nullptr};
            CMSetPropertyFilter(instance, request.properties, keys);
            setReference(instance, shape.farRole, far);
            setReference(instance, shape.nearRole, near);
            instances.push_back(instance);
        }
        return true;
    };
    return forEachPair(lines, request, shape, factory, association::noNearPaths, status, build);
}

// The frame of every operation: the entry marker and the barrier. The body calls finish() at
// the end of its normal path, and does not when a step failed.
template <class Body>
CMPIStatus associationOperation(const MarkerLines& lines, const AssociationRequest& request,
                                Body body) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        CMPIStatus status = succeeded;
        body(&status);
        return status;
    });
}

template <class Association>
CMPIStatus enumAssociationNames(const MarkerLines& lines, const AssociationRequest& request) {
    return associationOperation(lines, request, [&](CMPIStatus* status) {
        const AssociationShape& shape = Association::shape();
        typename Association::Factory factory(true, false);
        const auto returnName = [&](CMPIObjectPath* far, CMPIObjectPath* near) {
            CMPIObjectPath* own = ownPath<Association>(lines, request, shape.ownNameFailed, status);
            if (own == nullptr) {
                return false;
            }
            addReferenceKey(own, shape.farRole, far);
            addReferenceKey(own, shape.nearRole, near);
            CMReturnObjectPath(request.result, own);
            return true;
        };
        if (forEachPair(lines, request, shape, factory, association::noNearNames, status,
                        returnName)) {
            finish(lines, request.result);
        }
    });
}

template <class Association>
CMPIStatus enumAssociations(const MarkerLines& lines, const AssociationRequest& request) {
    return associationOperation(lines, request, [&](CMPIStatus* status) {
        std::vector<CMPIInstance*> instances;
        if (Association::build(request.ref, request.properties, request.context, instances,
                               status)) {
            deliver(request.result, instances);
            finish(lines, request.result);
        }
    });
}

template <class Association>
CMPIStatus getAssociation(const MarkerLines& lines, const AssociationRequest& request) {
    return associationOperation(lines, request, [&](CMPIStatus* status) {
        CMPIStatus aside = succeeded;
        if (!hasKeys(request.ref, &aside)) {
            lines.failed(keyMissingText);
            CMReturnDone(request.result);
            return;
        }
        std::vector<CMPIInstance*> instances;
        if (!Association::build(request.ref, request.properties, request.context, instances,
                                status)) {
            return;
        }
        if (CMPIInstance* found = findByPath(request.ref, instances, &aside); found != nullptr) {
            CMReturnInstance(request.result, found);
        }
        finish(lines, request.result);
    });
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
