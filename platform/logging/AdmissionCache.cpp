#include "logging/AdmissionCache.h"

namespace qelo::logging {
namespace {

using Slot = AdmissionCache::Slot;

void fill(Slot& slot, const std::string& component, const LoggerCore::Admission& admission) {
    slot.generation = admission.generation;
    slot.size = static_cast<std::uint32_t>(component.size());
    slot.thresholds = admission.thresholds;
    std::memcpy(slot.name.data(), component.data(), component.size());
}

// Not inlined, so that its calls do not weigh on the path of the remembered answer.
[[gnu::noinline]] Threshold lookUp(LoggerCore& core, AdmissionCache::Pair pair, Channel channel,
                                   const std::string& component) {
    const LoggerCore::Admission admission = core.admissionOf(component);
    if (component.size() <= AdmissionCache::kLongestName) {
        pair.older = pair.newer;
        fill(pair.newer, component, admission);
    }
    return admission.thresholds[static_cast<std::size_t>(channel)];
}

Threshold thresholdOf(LoggerCore& core, AdmissionCache& cache, Channel channel,
                      const std::string& component) {
    const AdmissionCache::Pair pair = cache.pairOf(component);
    const std::uint32_t generation = core.generation();
    if (pair.newer.holds(component, generation)) {
        return pair.newer.thresholds[static_cast<std::size_t>(channel)];
    }
    if (pair.older.holds(component, generation)) {
        return pair.older.thresholds[static_cast<std::size_t>(channel)];
    }
    return lookUp(core, pair, channel, component);
}

} // namespace

bool isAdmitted(LoggerCore& core, AdmissionCache& cache, Channel channel,
                const std::string& component, int level) {
    if (cache.linesToCheck-- == 0) {
        cache.linesToCheck = AdmissionCache::kLinesPerCheck;
        core.refreshIfDue();
    }
    if (level < thresholdOf(core, cache, channel, component)) {
        return false;
    }
    cache.linesToCheck = 0;
    return true;
}

} // namespace qelo::logging
