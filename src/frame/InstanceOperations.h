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

inline bool hasKeys(const CMPIObjectPath* path, CMPIStatus* status) {
    return !isNull(path) && path->ft->getKeyCount(path, status) != 0;
}

// The end of an operation's normal path. It comes while what the operation has built is still
// there: a factory tells of its end after the operation has told of its own.
template <class Lines> void finish(const Lines& lines, const CMPIResult* result) {
    CMReturnDone(result);
    lines.leave();
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
        finish(lines, request.result);
        return status;
    });
}

// Each of these returns instances and finishes the operation; when the factory fails, it says
// so and leaves the operation unfinished.

// Every instance.
template <class Class, class Lines>
void returnAll(const Lines& lines, const InstanceRequest& request, CMPIStatus* status) {
    std::vector<CMPIInstance*> instances;
    typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
    if (collectAll<Class>(lines, request, factory, instances, status)) {
        deliver(request.result, instances);
        finish(lines, request.result);
    }
}

// The instance of that key's text, if there is one.
template <class Class, class Lines>
void returnOne(const Lines& lines, const InstanceRequest& request, CMPIString* key,
               CMPIStatus* status) {
    std::vector<CMPIInstance*> instances;
    typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
    instances.reserve(factory.getNumberOfInstances());
    if (factory.one(request.broker, request.ref, key, request.properties, instances, status) != 0) {
        lines.failed(Class::oneFailed);
        return;
    }
    deliver(request.result, instances);
    finish(lines, request.result);
}

template <class Class, class Lines>
CMPIStatus enumInstances(Lines lines, const InstanceRequest& request) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        Class::refresh();
        CMPIStatus status = succeeded;
        returnAll<Class>(lines, request, &status);
        return status;
    });
}

// The first of the instances whose own path equals the request's, or null. `status` receives
// that of the last path looked at.
inline CMPIInstance* findByPath(const CMPIObjectPath* wanted,
                                const std::vector<CMPIInstance*>& instances, CMPIStatus* status) {
    CMPIInstance* found = nullptr;
    forEachCounted(instances, [&](CMPIInstance* instance) {
        if (found == nullptr) {
            const CMPIObjectPath* path = instance->ft->getObjectPath(instance, status);
            if (!isNull(path) && isObjPathsEqual(wanted, path, false)) {
                found = instance;
            }
        }
    });
    return found;
}

// As returnAll, of the first instance whose path equals the request's.
template <class Class, class Lines>
void returnSamePath(const Lines& lines, const InstanceRequest& request, CMPIStatus* status) {
    std::vector<CMPIInstance*> instances;
    typename Class::Factory factory(Class::firstFlag, !Class::firstFlag);
    if (!collectAll<Class>(lines, request, factory, instances, status)) {
        return;
    }
    CMPIStatus aside = succeeded;
    CMPIStatus* told = Class::everyCallReports ? status : &aside;
    if (CMPIInstance* found = findByPath(request.ref, instances, told); found != nullptr) {
        CMReturnInstance(request.result, found);
    }
    finish(lines, request.result);
}

// GetInstance by the class's key, or, where the request lacks it, of every instance. A
// request without keys fails.
template <class Class, class Lines>
CMPIStatus getInstanceByKeyOrAll(Lines lines, const InstanceRequest& request) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        Class::refresh();
        CMPIStatus status = succeeded;
        CMPIStatus aside = succeeded;
        if (!hasKeys(request.ref, &aside)) {
            status = makeStatus(request.broker, CMPI_RC_ERR_FAILED, keyMissingText);
            traceToBroker(request.broker, 2, Class::component, keyMissingText);
            return status;
        }
        const CMPIData key = keyOf(request.ref, Class::key);
        if (holdsText(key)) {
            returnOne<Class>(lines, request, key.value.string, &status);
        } else {
            returnAll<Class>(lines, request, &status);
        }
        return status;
    });
}

// GetInstance by the class's key, or, where the request lacks it, by comparing paths. A
// request without keys is told in a line and answered with nothing. A class states
// `everyCallReports`: whether the request's status receives that of counting keys and of taking
// an instance's path, and `exitLineWithoutKeys`: whether a request without keys leaves with the
// exit line.
template <class Class, class Lines>
CMPIStatus getInstanceByKeyOrPath(Lines lines, const InstanceRequest& request) {
    return guarded(request.broker, lines.unit(), lines.site(), [&] {
        lines.enter();
        Class::refresh();
        CMPIStatus status = succeeded;
        CMPIStatus aside = succeeded;
        if (!hasKeys(request.ref, Class::everyCallReports ? &status : &aside)) {
            lines.failed(keyMissingText);
            CMReturnDone(request.result);
            if (Class::exitLineWithoutKeys) {
                lines.leave();
            }
            return status;
        }
        const CMPIData key = keyOf(request.ref, Class::key);
        if (holdsText(key)) {
            returnOne<Class>(lines, request, key.value.string, &status);
        } else {
            returnSamePath<Class>(lines, request, &status);
        }
        return status;
    });
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
