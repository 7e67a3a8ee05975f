// The heart of the stand-alone object manager: finds the provider of a class, loads it on
// first use, calls it over CMPI and turns its answers into CIM values. Providers reach each
// other through the same object.
//
// Safe to use from several threads at once; a provider is called by several threads at once
// too. The destructor shuts the providers down and must not run while an operation does.
//
// When a provider answers an error after it delivered results, those results have already
// reached the sink; the operation then throws all the same.
#pragma once

#include "Hooks.h"
#include "Registration.h"
#include "Router.h"

#include <memory>
#include <string>
#include <vector>

struct _CMPIBroker;

namespace qelo::broker {

struct DispatcherOptions {
    // Where libraries named without a path are looked for, in this order.
    std::vector<std::string> libraryDirectories;
    BrokerHooks hooks;
};

class Dispatcher final : public Router {
public:
    explicit Dispatcher(DispatcherOptions options);
    ~Dispatcher() override;
    Dispatcher(const Dispatcher&) = delete;
    Dispatcher& operator=(const Dispatcher&) = delete;

    // Registers a provider; it is loaded when it is first needed. Throws
    // std::invalid_argument for a registration without class, namespace, provider, library
    // or type, and when another one serves the same class, namespace and type already.
    void add(ProviderRegistration registration);
    void add(const std::vector<ProviderRegistration>& registrations);

    std::vector<ProviderRegistration> registrations() const;

    // Loads every provider and asks it for every registered type. Returns one line of text
    // for each that cannot be had; none: all is well.
    std::vector<std::string> loadAll();

    // Calls the clean-up of every provider that was loaded and unloads the libraries. Later
    // operations load them again. Must not run while an operation does.
    void shutdown();

    // The broker as providers see it.
    const _CMPIBroker* broker() const;

    void enumerateInstanceNames(const OperationContext& context, const cim::ObjectPath& classPath,
                                const client::PathSink& sink) override;
    void enumerateInstances(const OperationContext& context, const cim::ObjectPath& classPath,
                            const client::PropertyList& properties,
                            const client::InstanceSink& sink) override;
    cim::Instance getInstance(const OperationContext& context, const cim::ObjectPath& path,
                              const client::PropertyList& properties) override;
    cim::ObjectPath createInstance(const OperationContext& context,
                                   const cim::ObjectPath& classPath,
                                   const cim::Instance& instance) override;
    void modifyInstance(const OperationContext& context, const cim::ObjectPath& path,
                        const cim::Instance& instance,
                        const client::PropertyList& properties) override;
    void deleteInstance(const OperationContext& context, const cim::ObjectPath& path) override;
    void execQuery(const OperationContext& context, const cim::ObjectPath& classPath,
                   const std::string& query, const std::string& language,
                   const client::InstanceSink& sink) override;
    void associators(const OperationContext& context, const cim::ObjectPath& path,
                     const client::AssociationFilter& filter,
                     const client::PropertyList& properties,
                     const client::InstanceSink& sink) override;
    void associatorNames(const OperationContext& context, const cim::ObjectPath& path,
                         const client::AssociationFilter& filter,
                         const client::PathSink& sink) override;
    void references(const OperationContext& context, const cim::ObjectPath& path,
                    const client::AssociationFilter& filter, const client::PropertyList& properties,
                    const client::InstanceSink& sink) override;
    void referenceNames(const OperationContext& context, const cim::ObjectPath& path,
                        const client::AssociationFilter& filter,
                        const client::PathSink& sink) override;
    client::MethodResult invokeMethod(const OperationContext& context, const cim::ObjectPath& path,
                                      const std::string& method,
                                      const client::Arguments& in) override;
    void setProperty(const OperationContext& context, const cim::ObjectPath& path,
                     const std::string& name, const cim::Value& value) override;
    cim::Value getProperty(const OperationContext& context, const cim::ObjectPath& path,
                           const std::string& name) override;
    // Accepted and dropped: nobody can subscribe here.
    void deliverIndication(const OperationContext& context, const std::string& nameSpace,
                           const cim::Instance& indication) override;

private:
    class Impl;
    std::unique_ptr<Impl> impl_;
};

} // namespace qelo::broker
