// Which association instances and which of their ends a role filter lets through.
#pragma once

#include <cim/Instance.h>
#include <client/Connection.h>

#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace qelo::broker {

// The references that an association instance has, as properties or as keys of its path.
std::vector<std::pair<std::string, cim::ObjectPath>> referencesOf(const cim::Instance& association);

// Whether two paths name the same object: the same keys, and classes that `related` accepts.
using ClassTest = std::function<bool(const std::string&, const std::string&)>;
bool sameObject(const cim::ObjectPath& left, const cim::ObjectPath& right,
                const ClassTest& related);

// Whether the association refers to `source` in that role; with an empty role, in any.
bool playsRole(const cim::Instance& association, const cim::ObjectPath& source,
               const std::string& role, const ClassTest& related);

// The other ends of the association as seen from `source` in `role`, those in `resultRole`
// only unless that is empty.
std::vector<cim::ObjectPath> otherEnds(const cim::Instance& association,
                                       const cim::ObjectPath& source, const std::string& role,
                                       const std::string& resultRole, const ClassTest& related);

} // namespace qelo::broker
