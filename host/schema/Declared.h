// Values that came without a type, given the type that the class declares: keys of object
// paths that were read from text, arguments of methods that a client did not type.
//
// Both throw client::CimError 4 (invalid parameter), with a text that names the key or the
// argument, when a value does not fit. Classes that the repository does not know are left as
// they are.
#pragma once

#include "ClassRepository.h"

#include <client/Connection.h>

#include <string>
#include <vector>

namespace qelo::schema {

// The path with its keys in the types that its class declares: a text becomes a datetime, a
// reference or a character, an integer one of another width, if the value fits. Keys of a
// class without them are refused, those that are missing are not: some providers find an
// instance by one of its keys. References inside are treated alike; one without a namespace
// is in that of the path. Names keep the spelling that they came with.
cim::ObjectPath withDeclaredKeys(const ClassRepository& repository, const cim::ObjectPath& path);

struct UntypedArgument {
    std::string name;
    cim::Value value; // a text, or an array of texts, unless it is typed
    bool typed = false;
};

struct DeclaredCall {
    std::string method;
    client::Arguments arguments;
};

// The call of a method of a class, with the names as the class spells them: in CIM, case does
// not tell names apart, but providers may. An argument that is typed must have the declared
// type; one that is null is left out, which means the same. Throws client::CimError 17 (method
// not found) where the class has no such method, 4 for an argument that the method has not.
DeclaredCall declaredCall(const ClassRepository& repository, const std::string& nameSpace,
                          const std::string& className, const std::string& method,
                          const std::vector<UntypedArgument>& arguments);

} // namespace qelo::schema
