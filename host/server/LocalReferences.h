// References to objects of this host, without its name. Providers name the host in the paths
// that they make, and a client that gets it that way takes the object for one of another
// machine; stock clients cannot even print such a path so that they can read it again.
#pragma once

#include <cim/Instance.h>

#include <optional>
#include <string>

namespace qelo::server {

// The path with the host taken off the references in its keys; nothing when there is none to
// be taken off, which is the usual case.
std::optional<cim::ObjectPath> withLocalReferences(const cim::ObjectPath& path,
                                                   const std::string& host);

// The same for an instance: the keys of its path and its properties.
std::optional<cim::Instance> withLocalReferences(const cim::Instance& instance,
                                                 const std::string& host);

} // namespace qelo::server
