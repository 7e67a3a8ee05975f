#include "LocalConnection.h"

#include <cmpi/cmpidt.h>
#include <schema/Declared.h>

#include <utility>

namespace qelo::broker {

LocalConnection::LocalConnection(std::shared_ptr<Router> router, OperationContext context,
                                 std::shared_ptr<const schema::ClassRepository> repository)
    : router_(std::move(router)), context_(std::move(context)), repository_(std::move(repository)) {
}

cim::ObjectPath LocalConnection::declared(const cim::ObjectPath& path) const {
    return repository_ ? schema::withDeclaredKeys(*repository_, path) : path;
}

const schema::ClassRepository& LocalConnection::classesOf(const std::string& nameSpace) const {
    if (!repository_) {
        throw client::CimError(CMPI_RC_ERR_NOT_SUPPORTED, "no classes are known here");
    }
    if (!repository_->hasNameSpace(nameSpace)) {
        throw client::CimError(CMPI_RC_ERR_INVALID_NAMESPACE,
                               "no such namespace: \"" + nameSpace + "\"");
    }
    return *repository_;
}

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
    cim::Instance found = router_->getInstance(context_, declared(path), properties);
    // As over a wire, where the answer has no path: it is the one that was asked for.
    cim::ObjectPath asked = path;
    asked.setClassName(found.className());
    found.setPath(std::move(asked));
    return found;
}

void LocalConnection::associators(const cim::ObjectPath& path,
                                  const client::AssociationFilter& filter,
                                  const client::PropertyList& properties,
                                  const client::InstanceSink& sink) {
    router_->associators(context_, declared(path), filter, properties, sink);
}

void LocalConnection::associatorNames(const cim::ObjectPath& path,
                                      const client::AssociationFilter& filter,
                                      const client::PathSink& sink) {
    router_->associatorNames(context_, declared(path), filter, sink);
}

void LocalConnection::references(const cim::ObjectPath& path,
                                 const client::AssociationFilter& filter,
                                 const client::PropertyList& properties,
                                 const client::InstanceSink& sink) {
    router_->references(context_, declared(path), filter, properties, sink);
}

void LocalConnection::referenceNames(const cim::ObjectPath& path,
                                     const client::AssociationFilter& filter,
                                     const client::PathSink& sink) {
    router_->referenceNames(context_, declared(path), filter, sink);
}

client::MethodResult LocalConnection::invokeMethod(const cim::ObjectPath& path,
                                                   const std::string& method,
                                                   const client::Arguments& in) {
    if (!repository_) {
        return router_->invokeMethod(context_, path, method, in);
    }
    std::vector<schema::UntypedArgument> given;
    for (const auto& [name, value] : in) {
        given.push_back({name, value, true});
    }
    const schema::DeclaredCall call =
        schema::declaredCall(*repository_, path.nameSpace(), path.className(), method, given);
    return router_->invokeMethod(context_, declared(path), call.method, call.arguments);
}

cim::Class LocalConnection::getClass(const cim::ObjectPath& classPath) {
    const cim::Class* known =
        classesOf(classPath.nameSpace()).find(classPath.nameSpace(), classPath.className());
    if (known == nullptr) {
        throw client::CimError(CMPI_RC_ERR_NOT_FOUND,
                               "no such class: \"" + classPath.className() + "\"");
    }
    return *known;
}

void LocalConnection::enumerateClassNames(const cim::ObjectPath& classPath, bool deep,
                                          const client::NameSink& sink) {
    const std::string& nameSpace = classPath.nameSpace();
    const std::string& className = classPath.className();
    const schema::ClassRepository& classes = classesOf(nameSpace);
    if (!className.empty() && classes.find(nameSpace, className) == nullptr) {
        throw client::CimError(CMPI_RC_ERR_INVALID_CLASS, "no such class: \"" + className + "\"");
    }
    for (const cim::Class* known : classes.subclasses(nameSpace, className, deep)) {
        sink(known->name);
    }
}

} // namespace qelo::broker
