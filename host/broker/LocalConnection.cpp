#include "LocalConnection.h"

#include <utility>

namespace qelo::broker {

LocalConnection::LocalConnection(std::shared_ptr<Router> router, OperationContext context)
    : router_(std::move(router)), context_(std::move(context)) {}

void LocalConnection::enumerateInstanceNames(const cim::ObjectPath& classPath,
                                             const client::PathSink& sink) {
    router_->enumerateInstanceNames(context_, classPath, sink);
}

void LocalConnection::enumerateInstances(const cim::ObjectPath& classPath,
                                         const client::PropertyList& properties,
                                         const client::InstanceSink& sink) {
    router_->enumerateInstances(context_, classPath, properties, sink);
}

cim::Instance LocalConnection::getInstance(const cim::ObjectPath& path,
                                           const client::PropertyList& properties) {
    return router_->getInstance(context_, path, properties);
}

void LocalConnection::associators(const cim::ObjectPath& path,
                                  const client::AssociationFilter& filter,
                                  const client::PropertyList& properties,
                                  const client::InstanceSink& sink) {
    router_->associators(context_, path, filter, properties, sink);
}

void LocalConnection::associatorNames(const cim::ObjectPath& path,
                                      const client::AssociationFilter& filter,
                                      const client::PathSink& sink) {
    router_->associatorNames(context_, path, filter, sink);
}

void LocalConnection::references(const cim::ObjectPath& path,
                                 const client::AssociationFilter& filter,
                                 const client::PropertyList& properties,
                                 const client::InstanceSink& sink) {
    router_->references(context_, path, filter, properties, sink);
}

void LocalConnection::referenceNames(const cim::ObjectPath& path,
                                     const client::AssociationFilter& filter,
                                     const client::PathSink& sink) {
    router_->referenceNames(context_, path, filter, sink);
}

client::MethodResult LocalConnection::invokeMethod(const cim::ObjectPath& path,
                                                   const std::string& method,
                                                   const client::Arguments& in) {
    return router_->invokeMethod(context_, path, method, in);
}

} // namespace qelo::broker
