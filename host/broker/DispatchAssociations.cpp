// The association operations of the dispatcher. Every association provider of the namespace
// that passes the class filter is asked, under the name of its own association class: real
// providers decide by that name. What a provider does not filter is filtered here.
#include "DispatcherImpl.h"

#include "AssociationRoles.h"

#include <algorithm>

namespace qelo::broker {
namespace {

using Kind = ResultObject::Kind;
using Target = ProviderRegistry::Target;

// One association operation on one object.
class Traversal {
public:
    Traversal(const Broker& broker, const OperationContext& context, cim::ObjectPath source,
              const client::AssociationFilter& filter)
        : broker_(broker), context_(context), source_(std::move(source)), filter_(filter) {}

    void associators(const Target& target, const client::PropertyList& properties,
                     const client::InstanceSink& sink) const;
    void associatorNames(const Target& target, const client::PathSink& sink) const;
    void references(const Target& target, const client::PropertyList& properties,
                    const client::InstanceSink& sink) const;
    void referenceNames(const Target& target, const client::PathSink& sink) const;

private:
    CMPIAssociationMI* interface(const Target& target) const {
        return target.provider->associationMI(source_.nameSpace());
    }
    ClassTest related() const;
    bool classPasses(const std::string& className) const;

    // Asks for the association instances; `role` filters at the provider only.
    void askReferences(const Target& target, const client::PropertyList& properties,
                       const client::InstanceSink& sink) const;

    // The ends that the role filters let through; nothing when no role is asked for, or the
    // provider has no references to judge by.
    std::optional<std::vector<cim::ObjectPath>> ends(const Target& target) const;
    bool endPasses(const std::optional<std::vector<cim::ObjectPath>>& ends,
                   const cim::ObjectPath& path) const;

    const Broker& broker_;
    const OperationContext& context_;
    const cim::ObjectPath source_;
    const client::AssociationFilter& filter_;
};

ClassTest Traversal::related() const {
    return [this](const std::string& left, const std::string& right) {
        return broker_.isA(source_.nameSpace(), left, right) ||
               broker_.isA(source_.nameSpace(), right, left);
    };
}

// Without a schema only the provider can tell what is a subclass of what.
bool Traversal::classPasses(const std::string& className) const {
    return filter_.resultClass.empty() || !broker_.hooks().schema.isA ||
           broker_.isA(source_.nameSpace(), className, filter_.resultClass);
}

void Traversal::askReferences(const Target& target, const client::PropertyList& properties,
                              const client::InstanceSink& sink) const {
    CMPIAssociationMI* mi = interface(target);
    NameList names(properties);
    ProviderCall call(broker_, context_, Kind::Instances);
    call.result().instanceSink = sink;
    call.result().properties = properties;
    call.result().nameSpace = source_.nameSpace();
    const auto* path = call.path(source_);
    call.run(target.provider->name(), [&] {
        const auto slot = mi->ft->references;
        return slot ? slot(mi, call.context(), call.cmpiResult(), path, target.className.c_str(),
                           nullIfEmpty(filter_.role), names.data())
                    : noSuchSlot();
    });
}

std::optional<std::vector<cim::ObjectPath>> Traversal::ends(const Target& target) const {
    if (filter_.role.empty() && filter_.resultRole.empty()) {
        return std::nullopt;
    }
    std::vector<cim::ObjectPath> found;
    try {
        askReferences(target, std::nullopt, [&](const cim::Instance& association) {
            for (cim::ObjectPath& end :
                 otherEnds(association, source_, filter_.role, filter_.resultRole, related())) {
                found.push_back(std::move(end));
            }
        });
    } catch (const client::CimError& error) {
        if (error.code() == CMPI_RC_ERR_NOT_SUPPORTED) {
            return std::nullopt;
        }
        if (error.code() != CMPI_RC_ERR_NOT_FOUND) {
            throw;
        }
    }
    return found;
}

bool Traversal::endPasses(const std::optional<std::vector<cim::ObjectPath>>& ends,
                          const cim::ObjectPath& path) const {
    return !ends || std::any_of(ends->begin(), ends->end(), [&](const cim::ObjectPath& end) {
        return sameObject(end, path, related());
    });
}

void Traversal::associators(const Target& target, const client::PropertyList& properties,
                            const client::InstanceSink& sink) const {
    CMPIAssociationMI* mi = interface(target);
    const auto allowed = ends(target);
    NameList names(properties);
    ProviderCall call(broker_, context_, Kind::Instances);
    call.result().properties = properties;
    call.result().nameSpace = source_.nameSpace();
    call.result().instanceSink = [&](const cim::Instance& instance) {
        if (classPasses(instance.className()) && endPasses(allowed, instance.path())) {
            sink(instance);
        }
    };
    const auto* path = call.path(source_);
    call.run(target.provider->name(), [&] {
        const auto slot = mi->ft->associators;
        return slot ? slot(mi, call.context(), call.cmpiResult(), path, target.className.c_str(),
                           nullIfEmpty(filter_.resultClass), nullIfEmpty(filter_.role),
                           nullIfEmpty(filter_.resultRole), names.data())
                    : noSuchSlot();
    });
}

void Traversal::associatorNames(const Target& target, const client::PathSink& sink) const {
    CMPIAssociationMI* mi = interface(target);
    const auto allowed = ends(target);
    ProviderCall call(broker_, context_, Kind::Paths);
    call.result().nameSpace = source_.nameSpace();
    call.result().pathSink = [&](const cim::ObjectPath& path) {
        if (classPasses(path.className()) && endPasses(allowed, path)) {
            sink(path);
        }
    };
    const auto* path = call.path(source_);
    call.run(target.provider->name(), [&] {
        const auto slot = mi->ft->associatorNames;
        return slot ? slot(mi, call.context(), call.cmpiResult(), path, target.className.c_str(),
                           nullIfEmpty(filter_.resultClass), nullIfEmpty(filter_.role),
                           nullIfEmpty(filter_.resultRole))
                    : noSuchSlot();
    });
}

void Traversal::references(const Target& target, const client::PropertyList& properties,
                           const client::InstanceSink& sink) const {
    if (filter_.role.empty()) {
        askReferences(target, properties, sink);
        return;
    }
    // The role may not be among the wanted properties: take all, judge, then drop.
    askReferences(target, std::nullopt, [&](const cim::Instance& association) {
        if (playsRole(association, source_, filter_.role, related())) {
            sink(withOnly(association, properties));
        }
    });
}

void Traversal::referenceNames(const Target& target, const client::PathSink& sink) const {
    CMPIAssociationMI* mi = interface(target);
    ProviderCall call(broker_, context_, Kind::Paths);
    call.result().nameSpace = source_.nameSpace();
    call.result().pathSink = [&](const cim::ObjectPath& path) {
        const cim::Instance association(path);
        // A path without references does not tell; the provider has seen the role too.
        if (filter_.role.empty() || referencesOf(association).empty() ||
            playsRole(association, source_, filter_.role, related())) {
            sink(path);
        }
    };
    const auto* path = call.path(source_);
    call.run(target.provider->name(), [&] {
        const auto slot = mi->ft->referenceNames;
        return slot ? slot(mi, call.context(), call.cmpiResult(), path, target.className.c_str(),
                           nullIfEmpty(filter_.role))
                    : noSuchSlot();
    });
}

} // namespace

std::vector<Dispatcher::Impl::Target>
Dispatcher::Impl::associationTargets(const cim::ObjectPath& path,
                                     const std::string& assocClass) const {
    requireNameSpace(path);
    if (broker.hooks().schema.hasClass && !registry.hasClass(path.nameSpace(), path.className())) {
        throw client::CimError(CMPI_RC_ERR_INVALID_PARAMETER,
                               "no such class: \"" + path.className() + "\"");
    }
    return registry.associations(path.nameSpace(), assocClass);
}

void Dispatcher::associators(const OperationContext& context, const cim::ObjectPath& path,
                             const client::AssociationFilter& filter,
                             const client::PropertyList& properties,
                             const client::InstanceSink& sink) {
    asOperation([&] {
        const Traversal traversal(impl_->broker, context, impl_->spelled(path), filter);
        impl_->askAll(
            impl_->associationTargets(path, filter.assocClass),
            [&](const Target& target) { traversal.associators(target, properties, sink); });
    });
}

void Dispatcher::associatorNames(const OperationContext& context, const cim::ObjectPath& path,
                                 const client::AssociationFilter& filter,
                                 const client::PathSink& sink) {
    asOperation([&] {
        const Traversal traversal(impl_->broker, context, impl_->spelled(path), filter);
        impl_->askAll(impl_->associationTargets(path, filter.assocClass),
                      [&](const Target& target) { traversal.associatorNames(target, sink); });
    });
}

void Dispatcher::references(const OperationContext& context, const cim::ObjectPath& path,
                            const client::AssociationFilter& filter,
                            const client::PropertyList& properties,
                            const client::InstanceSink& sink) {
    asOperation([&] {
        const Traversal traversal(impl_->broker, context, impl_->spelled(path), filter);
        impl_->askAll(
            impl_->associationTargets(path, filter.resultClass),
            [&](const Target& target) { traversal.references(target, properties, sink); });
    });
}

void Dispatcher::referenceNames(const OperationContext& context, const cim::ObjectPath& path,
                                const client::AssociationFilter& filter,
                                const client::PathSink& sink) {
    asOperation([&] {
        const Traversal traversal(impl_->broker, context, impl_->spelled(path), filter);
        impl_->askAll(impl_->associationTargets(path, filter.resultClass),
                      [&](const Target& target) { traversal.referenceNames(target, sink); });
    });
}

} // namespace qelo::broker
