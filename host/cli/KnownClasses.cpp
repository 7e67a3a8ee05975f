#include "KnownClasses.h"

#include <cim/ObjectPath.h>

#include <algorithm>

namespace qelo::cli {

const std::vector<std::string>& knownAssociations() {
    static const std::vector<std::string> classes = {"ZANTH_AccountHostedService",
                                                     "ZANTH_SimElementCapabilities"};
    return classes;
}

bool isKnownAssociation(std::string_view className) {
    const auto& classes = knownAssociations();
    return std::any_of(classes.begin(), classes.end(),
                       [&](const std::string& known) { return cim::sameName(known, className); });
}

} // namespace qelo::cli
