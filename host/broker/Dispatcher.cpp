#include "Dispatcher.h"

#include "DispatcherImpl.h"

#include <algorithm>

namespace qelo::broker {

cim::Instance withOnly(const cim::Instance& instance, const client::PropertyList& properties) {
    if (!properties) {
        return instance;
    }
    cim::Instance out(instance.path());
    for (const cim::Instance::Property& property : instance.properties()) {
        const bool wanted =
            std::any_of(properties->begin(), properties->end(), [&](const std::string& name) {
                return cim::sameName(name, property.name);
            });
        if (wanted) {
            out.setProperty(property.name, property.value, property.origin);
        }
    }
    return out;
}

void Dispatcher::Impl::requireNameSpace(const cim::ObjectPath& path) const {
    const auto& schemaHas = broker.hooks().schema.hasNameSpace;
    if (!registry.hasNameSpace(path.nameSpace()) && !(schemaHas && schemaHas(path.nameSpace()))) {
        throw client::CimError(CMPI_RC_ERR_INVALID_NAMESPACE,
                               "no such namespace: \"" + path.nameSpace() + "\"");
    }
}

void Dispatcher::Impl::requireClass(const cim::ObjectPath& path) const {
    requireNameSpace(path);
    if (!registry.hasClass(path.nameSpace(), path.className())) {
        throw client::CimError(CMPI_RC_ERR_INVALID_CLASS,
                               "no such class: \"" + path.className() + "\"");
    }
}

Dispatcher::Impl::Target Dispatcher::Impl::requireServer(const cim::ObjectPath& path,
                                                         ProviderType type, CMPIrc code) const {
    Target target = registry.serverOf(path.nameSpace(), path.className(), type);
    if (target.provider) {
        return target;
    }
    requireClass(path);
    throw client::CimError(cimStatusCode(code), "class " + path.className() +
                                                    " has no provider of type " +
                                                    providerTypeName(type));
}

cim::ObjectPath Dispatcher::Impl::spelled(const cim::ObjectPath& path) const {
    cim::ObjectPath copy = path;
    copy.setClassName(registry.registeredSpelling(path.className()));
    return copy;
}

std::vector<const cim::Instance*>
Dispatcher::Impl::staticInstances(const cim::ObjectPath& classPath) const {
    const auto& instancesOf = broker.hooks().schema.instances;
    if (!instancesOf) {
        return {};
    }
    const std::string& nameSpace = classPath.nameSpace();
    auto kept = instancesOf(nameSpace, classPath.className());
    const auto isServed = [&](const cim::Instance* instance) {
        return registry.serverOf(nameSpace, instance->className(), ProviderType::Instance)
                   .provider != nullptr;
    };
    kept.erase(std::remove_if(kept.begin(), kept.end(), isServed), kept.end());
    return kept;
}

void Dispatcher::Impl::askAll(const std::vector<Target>& targets,
                              const std::function<void(const Target&)>& ask) const {
    for (const Target& target : targets) {
        try {
            ask(target);
        } catch (const client::CimError& error) {
            const bool unsupported = error.code() == CMPI_RC_ERR_NOT_SUPPORTED;
            const bool nothing = error.code() == CMPI_RC_ERR_NOT_FOUND;
            if (!nothing && !(unsupported && targets.size() > 1)) {
                throw;
            }
        }
    }
}

Dispatcher::Dispatcher(DispatcherOptions options)
    : impl_(std::make_unique<Impl>(*this, std::move(options))) {}

Dispatcher::~Dispatcher() {
    try {
        shutdown();
    } catch (...) {
        // Out of memory, or a log hook failed: there is nothing left to do about it.
    }
}

void Dispatcher::add(ProviderRegistration registration) {
    impl_->registry.add(std::move(registration));
}

void Dispatcher::add(const std::vector<ProviderRegistration>& registrations) {
    for (const ProviderRegistration& registration : registrations) {
        add(registration);
    }
}

std::vector<ProviderRegistration> Dispatcher::registrations() const {
    return impl_->registry.registrations();
}

std::vector<std::string> Dispatcher::loadAll() { return impl_->registry.loadAll(); }

void Dispatcher::shutdown() {
    impl_->registry.shutDown();
    impl_->broker.freeAllBlocks();
}

const _CMPIBroker* Dispatcher::broker() const { return impl_->broker.cmpi(); }

void Dispatcher::deliverIndication(const OperationContext&, const std::string&,
                                   const cim::Instance&) {}

} // namespace qelo::broker
