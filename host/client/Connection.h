// What a client can ask of an object manager: the operations of "CIM Operations over HTTP"
// (DMTF DSP0200) under its own names, in protocol-independent terms. One implementation
// loads providers into this process, another talks to a server; commands cannot tell which.
#pragma once

#include <cim/Class.h>
#include <cim/Instance.h>

#include <functional>
#include <optional>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace qelo::client {

// An operation that an object manager refused or could not carry out. `code` is the CIM
// status code (1 failed, 6 not found, 7 not supported ...), what() a single line of text.
class CimError : public std::runtime_error {
public:
    CimError(unsigned int code, const std::string& message)
        : std::runtime_error(message), code_(code) {}
    unsigned int code() const { return code_; }

private:
    unsigned int code_;
};

// Nothing: all properties. Otherwise the named ones (an empty list: none but the keys).
using PropertyList = std::optional<std::vector<std::string>>;

using InstanceSink = std::function<void(const cim::Instance&)>;
using PathSink = std::function<void(const cim::ObjectPath&)>;

struct AssociationFilter {
    std::string assocClass; // each empty: no filter
    std::string resultClass;
    std::string role;
    std::string resultRole;
};

using NameSink = std::function<void(const std::string&)>;

using Arguments = std::vector<std::pair<std::string, cim::Value>>;

struct MethodResult {
    cim::Value returnValue;
    Arguments out;
};

// Every operation throws CimError; results go to the sink in the order in which the
// provider returned them. `path` carries the namespace.
class Connection {
public:
    virtual ~Connection() = default;

    virtual void enumerateInstanceNames(const cim::ObjectPath& classPath, const PathSink& sink) = 0;
    virtual void enumerateInstances(const cim::ObjectPath& classPath,
                                    const PropertyList& properties, const InstanceSink& sink) = 0;
    // CimError 6 (not found) when there is no such instance.
    virtual cim::Instance getInstance(const cim::ObjectPath& path,
                                      const PropertyList& properties) = 0;

    virtual void associators(const cim::ObjectPath& path, const AssociationFilter& filter,
                             const PropertyList& properties, const InstanceSink& sink) = 0;
    virtual void associatorNames(const cim::ObjectPath& path, const AssociationFilter& filter,
                                 const PathSink& sink) = 0;
    virtual void references(const cim::ObjectPath& path, const AssociationFilter& filter,
                            const PropertyList& properties, const InstanceSink& sink) = 0;
    virtual void referenceNames(const cim::ObjectPath& path, const AssociationFilter& filter,
                                const PathSink& sink) = 0;

    virtual MethodResult invokeMethod(const cim::ObjectPath& path, const std::string& method,
                                      const Arguments& in) = 0;

    // The class with everything it inherits, qualifiers included. CimError 6 when there is
    // no such class.
    virtual cim::Class getClass(const cim::ObjectPath& classPath) = 0;
    // The names of the subclasses of a class, or, when the path names none, of the classes
    // without superclass; `deep`: of all below them too.
    virtual void enumerateClassNames(const cim::ObjectPath& classPath, bool deep,
                                     const NameSink& sink) = 0;
};

} // namespace qelo::client
