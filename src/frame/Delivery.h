// Handing results to the broker. Results are counted in 16 bits, as everywhere in this
// provider, and what is null is passed over.
#pragma once

#include "BrokerAccess.h"

#include <cstdint>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Calls `visit` for each element in order, up to the 16-bit count, null ones left out.
template <class Object, class Visit>
void forEachCounted(const std::vector<Object*>& objects, Visit visit) {
    const auto count = static_cast<std::uint16_t>(objects.size());
    for (std::uint16_t i = 0; i < count; ++i) {
        if (Object* object = objects.at(i); !isNull(object)) {
            visit(object);
        }
    }
}

// Returns each path, placed in the namespace of `ref` once more.
inline void deliver(const CMPIResult* result, const CMPIObjectPath* ref,
                    const std::vector<CMPIObjectPath*>& paths, CMPIStatus* status) {
    forEachCounted(paths, [&](CMPIObjectPath* path) {
        setNameSpaceFrom(path, ref, status);
        CMReturnObjectPath(result, path);
    });
}

// Returns each instance.
inline void deliver(const CMPIResult* result, const std::vector<CMPIInstance*>& instances) {
    forEachCounted(instances, [&](CMPIInstance* instance) { CMReturnInstance(result, instance); });
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
