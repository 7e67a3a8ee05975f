#include "logging/LogConfig.h"

#include <algorithm>

namespace qelo::logging {
namespace {

constexpr std::size_t kMostComponents = 1024;

std::string_view parentOf(std::string_view component) {
    const std::size_t dot = component.rfind('.');
    return dot == std::string_view::npos ? std::string_view() : component.substr(0, dot);
}

} // namespace

bool Thresholds::set(std::string_view component, Threshold threshold) {
    if (component.empty()) {
        root_ = threshold;
        return true;
    }
    const auto known = components_.find(component);
    if (known != components_.end()) {
        known->second = threshold;
        return true;
    }
    if (components_.size() >= kMostComponents) {
        return false;
    }
    components_.emplace(component, threshold);
    return true;
}

Threshold Thresholds::of(std::string_view component) const {
    if (components_.empty()) {
        return root_;
    }
    for (; !component.empty(); component = parentOf(component)) {
        const auto found = components_.find(component);
        if (found != components_.end()) {
            return found->second;
        }
    }
    return root_;
}

Threshold Thresholds::lowest() const {
    Threshold lowest = root_;
    for (const auto& [component, threshold] : components_) {
        lowest = std::min(lowest, threshold);
    }
    return lowest;
}

Threshold ChannelConfig::thresholdOf(std::string_view component) const {
    return target.kind == SinkKind::None ? kAdmitsNothing : thresholds.of(component);
}

Threshold ChannelConfig::lowestThreshold() const {
    return target.kind == SinkKind::None ? kAdmitsNothing : thresholds.lowest();
}

} // namespace qelo::logging
