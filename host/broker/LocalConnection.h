// A client connection to the providers of this process: no protocol in between.
//
// Results reach the sink as the provider returns them, in the calling thread. When a provider
// answers an error after it delivered results, the sink has seen those results and the
// operation throws CimError all the same. What a sink throws ends the operation and comes out.
// Safe to use from several threads at once.
#pragma once

#include "Dispatcher.h"

#include <schema/ClassRepository.h>

#include <memory>

namespace qelo::broker {

class LocalConnection final : public client::Connection {
public:
    // Every request is made with `context`. The default is nobody in particular. Without a
    // repository, no class is known: keys keep the types that they come with, and the
    // operations on classes answer 7 (not supported).
    explicit LocalConnection(std::shared_ptr<Router> router, OperationContext context = {},
                             std::shared_ptr<const schema::ClassRepository> repository = nullptr);

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
    cim::Class getClass(const cim::ObjectPath& classPath) override;
    void enumerateClassNames(const cim::ObjectPath& classPath, bool deep,
                             const client::NameSink& sink) override;

private:
    // The path with its keys in the types that its class declares.
    cim::ObjectPath declared(const cim::ObjectPath& path) const;
    // CimError when there is no repository, or not that namespace in it.
    const schema::ClassRepository& classesOf(const std::string& nameSpace) const;

    std::shared_ptr<Router> router_;
    OperationContext context_;
    std::shared_ptr<const schema::ClassRepository> repository_;
};

} // namespace qelo::broker
