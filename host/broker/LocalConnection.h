// A client connection to the providers of this process: no protocol in between.
//
// Results reach the sink as the provider returns them, in the calling thread. When a provider
// answers an error after it delivered results, the sink has seen those results and the
// operation throws CimError all the same. What a sink throws ends the operation and comes out.
// Safe to use from several threads at once.
#pragma once

#include "Dispatcher.h"

#include <memory>

namespace qelo::broker {

class LocalConnection final : public client::Connection {
public:
    // Every request is made with `context`. The default is nobody in particular.
    explicit LocalConnection(std::shared_ptr<Router> router, OperationContext context = {});

    void enumerateInstanceNames(const cim::ObjectPath& classPath,
                                const client::PathSink& sink) override;
    void enumerateInstances(const cim::ObjectPath& classPath,
                            const client::PropertyList& properties,
                            const client::InstanceSink& sink) override;
    cim::Instance getInstance(const cim::ObjectPath& path,
                              const client::PropertyList& properties) override;
    void associators(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                     const client::PropertyList& properties,
                     const client::InstanceSink& sink) override;
    void associatorNames(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                         const client::PathSink& sink) override;
    void references(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                    const client::PropertyList& properties,
                    const client::InstanceSink& sink) override;
    void referenceNames(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                        const client::PathSink& sink) override;
    client::MethodResult invokeMethod(const cim::ObjectPath& path, const std::string& method,
                                      const client::Arguments& in) override;

private:
    std::shared_ptr<Router> router_;
    OperationContext context_;
};

} // namespace qelo::broker
