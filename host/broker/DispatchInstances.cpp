// The instance operations of the dispatcher.
#include "DispatcherImpl.h"

namespace qelo::broker {
namespace {

using Kind = ResultObject::Kind;
} // namespace

void Dispatcher::enumerateInstanceNames(const OperationContext& context,
                                        const cim::ObjectPath& classPath,
                                        const client::PathSink& sink) {
    asOperation([&] {
        const std::string& nameSpace = classPath.nameSpace();
        const auto targets =
            impl_->registry.serving(nameSpace, classPath.className(), ProviderType::Instance);
        if (targets.empty()) {
            impl_->requireClass(classPath);
        }
        impl_->askAll(targets, [&](const Impl::Target& target) {
            CMPIInstanceMI* mi = target.provider->instanceMI(nameSpace);
            ProviderCall call(impl_->broker, context, Kind::Paths);
            call.result().pathSink = sink;
            call.result().nameSpace = nameSpace;
            const auto* path = call.path(cim::ObjectPath(nameSpace, target.className));
            call.run(target.provider->name(), [&] {
                const auto slot = mi->ft->enumerateInstanceNames;
                return slot ? slot(mi, call.context(), call.cmpiResult(), path) : noSuchSlot();
            });
        });
        for (const cim::Instance* kept : impl_->staticInstances(classPath)) {
            sink(kept->path());
        }
    });
}

void Dispatcher::enumerateInstances(const OperationContext& context,
                                    const cim::ObjectPath& classPath,
                                    const client::PropertyList& properties,
                                    const client::InstanceSink& sink) {
    asOperation([&] {
        const std::string& nameSpace = classPath.nameSpace();
        const auto targets =
            impl_->registry.serving(nameSpace, classPath.className(), ProviderType::Instance);
        if (targets.empty()) {
            impl_->requireClass(classPath);
        }
        impl_->askAll(targets, [&](const Impl::Target& target) {
            CMPIInstanceMI* mi = target.provider->instanceMI(nameSpace);
            NameList names(properties);
            ProviderCall call(impl_->broker, context, Kind::Instances);
            call.result().instanceSink = sink;
            call.result().properties = properties;
            call.result().nameSpace = nameSpace;
            const auto* path = call.path(cim::ObjectPath(nameSpace, target.className));
            call.run(target.provider->name(), [&] {
                const auto slot = mi->ft->enumerateInstances;
                return slot ? slot(mi, call.context(), call.cmpiResult(), path, names.data())
                            : noSuchSlot();
            });
        });
        for (const cim::Instance* kept : impl_->staticInstances(classPath)) {
            sink(withOnly(*kept, properties));
        }
    });
}

cim::Instance Dispatcher::getInstance(const OperationContext& context, const cim::ObjectPath& path,
                                      const client::PropertyList& properties) {
    return asOperation([&] {
        for (const cim::Instance* kept : impl_->staticInstances(path)) {
            if (kept->path() == path) {
                return withOnly(*kept, properties);
            }
        }
        const auto target =
            impl_->requireServer(path, ProviderType::Instance, CMPI_RC_ERR_NOT_FOUND);
        CMPIInstanceMI* mi = target.provider->instanceMI(path.nameSpace());
        NameList names(properties);
        std::optional<cim::Instance> found;
        ProviderCall call(impl_->broker, context, Kind::Instances);
        call.result().properties = properties;
        call.result().nameSpace = path.nameSpace();
        // Some providers answer all instances when a key is missing: the first one counts.
        call.result().instanceSink = [&](const cim::Instance& instance) {
            if (!found) {
                found = instance;
            }
        };
        const auto* wanted = call.path(impl_->spelled(path));
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->getInstance;
            return slot ? slot(mi, call.context(), call.cmpiResult(), wanted, names.data())
                        : noSuchSlot();
        });
        if (!found) {
            throw client::CimError(CMPI_RC_ERR_NOT_FOUND, "no such instance: " + path.toText());
        }
        return std::move(*found);
    });
}

cim::ObjectPath Dispatcher::createInstance(const OperationContext& context,
                                           const cim::ObjectPath& classPath,
                                           const cim::Instance& instance) {
    return asOperation([&] {
        const auto target =
            impl_->requireServer(classPath, ProviderType::Instance, CMPI_RC_ERR_NOT_SUPPORTED);
        CMPIInstanceMI* mi = target.provider->instanceMI(classPath.nameSpace());
        std::optional<cim::ObjectPath> made;
        ProviderCall call(impl_->broker, context, Kind::Paths);
        call.result().nameSpace = classPath.nameSpace();
        call.result().pathSink = [&](const cim::ObjectPath& path) {
            if (!made) {
                made = path;
            }
        };
        const auto* path = call.path(impl_->spelled(classPath));
        const auto* wanted =
            &fromCim(call.arena(), instance, Ownership::Contained, &impl_->broker)->cmpi;
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->createInstance;
            return slot ? slot(mi, call.context(), call.cmpiResult(), path, wanted) : noSuchSlot();
        });
        if (!made) {
            throw client::CimError(CMPI_RC_ERR_FAILED,
                                   target.provider->name() + " did not tell the new path");
        }
        return std::move(*made);
    });
}

void Dispatcher::modifyInstance(const OperationContext& context, const cim::ObjectPath& path,
                                const cim::Instance& instance,
                                const client::PropertyList& properties) {
    asOperation([&] {
        const auto target =
            impl_->requireServer(path, ProviderType::Instance, CMPI_RC_ERR_NOT_SUPPORTED);
        CMPIInstanceMI* mi = target.provider->instanceMI(path.nameSpace());
        NameList names(properties);
        ProviderCall call(impl_->broker, context, Kind::Nothing);
        const auto* changed = call.path(impl_->spelled(path));
        const auto* values =
            &fromCim(call.arena(), instance, Ownership::Contained, &impl_->broker)->cmpi;
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->modifyInstance;
            return slot ? slot(mi, call.context(), call.cmpiResult(), changed, values, names.data())
                        : noSuchSlot();
        });
    });
}

void Dispatcher::deleteInstance(const OperationContext& context, const cim::ObjectPath& path) {
    asOperation([&] {
        const auto target =
            impl_->requireServer(path, ProviderType::Instance, CMPI_RC_ERR_NOT_SUPPORTED);
        CMPIInstanceMI* mi = target.provider->instanceMI(path.nameSpace());
        ProviderCall call(impl_->broker, context, Kind::Nothing);
        const auto* doomed = call.path(impl_->spelled(path));
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->deleteInstance;
            return slot ? slot(mi, call.context(), call.cmpiResult(), doomed) : noSuchSlot();
        });
    });
}

void Dispatcher::execQuery(const OperationContext& context, const cim::ObjectPath& classPath,
                           const std::string& query, const std::string& language,
                           const client::InstanceSink& sink) {
    asOperation([&] {
        const auto target =
            impl_->requireServer(classPath, ProviderType::Instance, CMPI_RC_ERR_NOT_SUPPORTED);
        CMPIInstanceMI* mi = target.provider->instanceMI(classPath.nameSpace());
        ProviderCall call(impl_->broker, context, Kind::Instances);
        call.result().instanceSink = sink;
        call.result().nameSpace = classPath.nameSpace();
        const auto* path = call.path(impl_->spelled(classPath));
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->execQuery;
            return slot ? slot(mi, call.context(), call.cmpiResult(), path, nullIfEmpty(query),
                               nullIfEmpty(language))
                        : noSuchSlot();
        });
    });
}

} // namespace qelo::broker
