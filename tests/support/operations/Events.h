// Pieces of what one request leaves in the events of the recording platform.
#pragma once

#include "support/platform/TracePoints.h"

#include <algorithm>
#include <string>
#include <vector>

namespace qelo::test {

using Events = std::vector<std::string>;

// Making a path of a class and placing it: the request's namespace is looked up for each.
inline Events placedPath(const std::string& className) {
    return {"broker: getNameSpace",
            "broker: getCharPtr",
            "broker: newObjectPath(root/cimv2," + className + ")",
            "broker: getNameSpace",
            "broker: getCharPtr",
            "broker: setNameSpace(root/cimv2)",
            "platform: getSystemName()",
            "broker: setHostname(host.example)"};
}

// A getter of a record that tells its name and its value.
inline Events getterLines(const std::string& unit, const std::string& getter,
                          const std::string& field, const std::string& value) {
    return {"METHOD: " + getter + "() was invoked in " + unit + " [Line: #]",
            "VARIABLE: '" + field + "' has Value '" + value + "' at line # in " + unit};
}

// The exit marker of a provider's operation.
inline Events exitMarker(const std::string& unit, const std::string& operation) {
    return {"EXITING: " + operation + "() in " + unit + " [Line: #]", std::string(78, '=')};
}

inline std::string destructorLine(const std::string& unit, const std::string& className) {
    return "METHOD: ~" + className + "() was invoked in " + unit + " [Line: #]";
}

inline Events joined(const std::vector<Events>& parts) {
    Events all;
    for (const Events& part : parts) {
        all.insert(all.end(), part.begin(), part.end());
    }
    return all;
}

// The last `count` events of a list, or all of them.
inline Events lastOf(const Events& events, std::size_t count) {
    return {events.end() - static_cast<std::ptrdiff_t>(std::min(count, events.size())),
            events.end()};
}

} // namespace qelo::test
