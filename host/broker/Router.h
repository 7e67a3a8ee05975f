// The way from the broker to whoever answers an operation: the up-calls of providers and the
// requests of clients take it alike.
//
// Every operation throws client::CimError when it is refused or fails. Results reach the sink
// in the calling thread before the operation returns; what the sink throws comes out again.
// Safe to call from several threads at once.
#pragma once

#include "OperationContext.h"

#include <cim/Instance.h>
#include <client/Connection.h>

#include <string>

namespace qelo::broker {

class Router {
public:
    virtual ~Router() = default;

    // Paths or instances of the class and its subclasses.
    virtual void enumerateInstanceNames(const OperationContext& context,
                                        const cim::ObjectPath& classPath,
                                        const client::PathSink& sink) = 0;
    virtual void enumerateInstances(const OperationContext& context,
                                    const cim::ObjectPath& classPath,
                                    const client::PropertyList& properties,
                                    const client::InstanceSink& sink) = 0;

    // CimError 6 when there is no such instance.
    virtual cim::Instance getInstance(const OperationContext& context, const cim::ObjectPath& path,
                                      const client::PropertyList& properties) = 0;

    // The path of the new instance.
    virtual cim::ObjectPath createInstance(const OperationContext& context,
                                           const cim::ObjectPath& classPath,
                                           const cim::Instance& instance) = 0;
    virtual void modifyInstance(const OperationContext& context, const cim::ObjectPath& path,
                                const cim::Instance& instance,
                                const client::PropertyList& properties) = 0;
    virtual void deleteInstance(const OperationContext& context, const cim::ObjectPath& path) = 0;

    // The class that the query is put to is the one of `classPath`.
    virtual void execQuery(const OperationContext& context, const cim::ObjectPath& classPath,
                           const std::string& query, const std::string& language,
                           const client::InstanceSink& sink) = 0;

    virtual void associators(const OperationContext& context, const cim::ObjectPath& path,
                             const client::AssociationFilter& filter,
                             const client::PropertyList& properties,
                             const client::InstanceSink& sink) = 0;
    virtual void associatorNames(const OperationContext& context, const cim::ObjectPath& path,
                                 const client::AssociationFilter& filter,
                                 const client::PathSink& sink) = 0;

    // Of the filter, resultClass (the association class) and role count.
    virtual void references(const OperationContext& context, const cim::ObjectPath& path,
                            const client::AssociationFilter& filter,
                            const client::PropertyList& properties,
                            const client::InstanceSink& sink) = 0;
    virtual void referenceNames(const OperationContext& context, const cim::ObjectPath& path,
                                const client::AssociationFilter& filter,
                                const client::PathSink& sink) = 0;

    virtual client::MethodResult invokeMethod(const OperationContext& context,
                                              const cim::ObjectPath& path,
                                              const std::string& method,
                                              const client::Arguments& in) = 0;

    virtual void setProperty(const OperationContext& context, const cim::ObjectPath& path,
                             const std::string& name, const cim::Value& value) = 0;
    virtual cim::Value getProperty(const OperationContext& context, const cim::ObjectPath& path,
                                   const std::string& name) = 0;

    virtual void deliverIndication(const OperationContext& context, const std::string& nameSpace,
                                   const cim::Instance& indication) = 0;
};

} // namespace qelo::broker
