// The instance operations that the classes share, written once. A class describes itself by
// a type `Class` with
//   Factory                          constructed afresh for every request
//   firstFlag                        the first of its two flags; the second is the opposite
//   refresh()                        what is done before anything is read
//   allPathsFailed, allInstancesFailed, oneFailed   the lines for a collector's failure
//   key                              the key by which one instance is looked up
//   component                        the provider, as the broker's trace knows it (where
//                                    getInstanceByKeyOrAll is used)
// `Lines` is one of the styles of OperationLines.h.
#pragma once

#include "Barrier.h"
#include "Delivery.h"
#include "OperationLines.h"
#include "ProviderTables.h"

#include <platform/TeskCommon.h>

#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

constexpr const char* keyMissingText = "At least one key should be passed";

// One request as the shared operations see it.
struct InstanceRequest {
    const CMPIBroker* broker;
    const CMPIResult* result;
    const CMPIObjectPath* ref;
    const char** properties;
};

// The request path's key for `name`, without a value when it has none.
inline CMPIData keyOf(const CMPIObjectPath* path, const char* name) {
    // The status of a missing key is of no interest to the request's own.
    return path->ft->getKey(path, name, nullptr);
}

inline bool hasKeys(const CMPIObjectPath* path) {
    return !isNull(path) && path->ft->getKeyCount(path, nullptr) != 0;
}

// Collects every instance; false, with the failure told, when the collector fails.
template <class Class, class Lines>
bool collectAll(const Lines& lines, const InstanceRequest& request,
                typename Class::Factory& factory, std::vector<CMPIInstance*>& instances,
                CMPIStatus* status) {
    instances.reserve(factory.getNumberOfInstances());
    if (factory.allInstances(request.broker, request.ref, request.properties, false, instances,
                             status) != 0) {
        lines.failed(Class::allInstancesFailed);
        return false;
    }
    return true;
}

template <class Class, class Lines>
CMPIStatus enumInstanceNames(Lines lines, const InstanceRequest& request) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        Class::refresh();
        CMPIStatus status = succeeded;
        std::vector<CMPIObjectPath*> paths;
        typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
        paths.reserve(factory.getNumberOfInstances());
        if (factory.allPaths(request.broker, request.ref, paths, &status) != 0) {
            lines.failed(Class::allPathsFailed);
            return status;
        }
        deliver(request.result, request.ref, paths, &status);
        CMReturnDone(request.result);
        lines.leave();
        return status;
    });
}

template <class Class, class Lines>
CMPIStatus enumInstances(Lines lines, const InstanceRequest& request) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        Class::refresh();
        CMPIStatus status = succeeded;
        std::vector<CMPIInstance*> instances;
        typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
        if (!collectAll<Class>(lines, request, factory, instances, &status)) {
            return status;
        }
        deliver(request.result, instances);
        CMReturnDone(request.result);
        lines.leave();
        return status;
    });
}

// Returns the instance of that key's text, if there is one; false when the factory fails.
template <class Class, class Lines>
bool returnOne(const Lines& lines, const InstanceRequest& request, CMPIString* key,
               CMPIStatus* status) {
    typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
    std::vector<CMPIInstance*> instances;
    instances.reserve(factory.getNumberOfInstances());
    if (factory.one(request.broker, request.ref, key, request.properties, instances, status) != 0) {
        lines.failed(Class::oneFailed);
        return false;
    }
    deliver(request.result, instances);
    return true;
}

// Returns every instance; false when the factory fails.
template <class Class, class Lines>
bool returnAll(const Lines& lines, const InstanceRequest& request, CMPIStatus* status) {
    std::vector<CMPIInstance*> instances;
    typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
    if (!collectAll<Class>(lines, request, factory, instances, status)) {
        return false;
    }
    deliver(request.result, instances);
    return true;
}

// The first of the instances whose own path equals the request's, or null.
inline CMPIInstance* findByPath(const CMPIObjectPath* wanted,
                                const std::vector<CMPIInstance*>& instances) {
    CMPIInstance* found = nullptr;
    forEachCounted(instances, [&](CMPIInstance* instance) {
        if (found == nullptr) {
            const CMPIObjectPath* path = instance->ft->getObjectPath(instance, nullptr);
            if (!isNull(path) && isObjPathsEqual(wanted, path, false)) {
                found = instance;
            }
        }
    });
    return found;
}

// Returns the first instance whose path equals the request's; false when the factory fails.
template <class Class, class Lines>
bool returnSamePath(const Lines& lines, const InstanceRequest& request, CMPIStatus* status) {
    std::vector<CMPIInstance*> instances;
    typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
    if (!collectAll<Class>(lines, request, factory, instances, status)) {
        return false;
    }
    if (CMPIInstance* found = findByPath(request.ref, instances); found != nullptr) {
        CMReturnInstance(request.result, found);
    }
    return true;
}

// GetInstance by the class's key, or, where the request lacks it, of every instance. A
// request without keys fails.
template <class Class, class Lines>
CMPIStatus getInstanceByKeyOrAll(Lines lines, const InstanceRequest& request) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        Class::refresh();
        CMPIStatus status = succeeded;
        if (!hasKeys(request.ref)) {
            status = makeStatus(request.broker, CMPI_RC_ERR_FAILED, keyMissingText);
            traceToBroker(request.broker, 2, Class::component, keyMissingText);
            return status;
        }
        const CMPIData key = keyOf(request.ref, Class::key);
        const bool done = holdsText(key)
                              ? returnOne<Class>(lines, request, key.value.string, &status)
                              : returnAll<Class>(lines, request, &status);
        if (!done) {
            return status;
        }
        CMReturnDone(request.result);
        lines.leave();
        return status;
    });
}

// GetInstance by the class's key, or, where the request lacks it, by comparing paths. A
// request without keys is told in a line and answered with nothing.
template <class Class, class Lines>
CMPIStatus getInstanceByKeyOrPath(Lines lines, const InstanceRequest& request) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        Class::refresh();
        CMPIStatus status = succeeded;
        if (!hasKeys(request.ref)) {
            lines.failed(keyMissingText);
        } else {
            const CMPIData key = keyOf(request.ref, Class::key);
            const bool done = holdsText(key)
                                  ? returnOne<Class>(lines, request, key.value.string, &status)
                                  : returnSamePath<Class>(lines, request, &status);
            if (!done) {
                return status;
            }
        }
        CMReturnDone(request.result);
        lines.leave();
        return status;
    });
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
