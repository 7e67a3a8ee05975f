#include "Dispatcher.h"

#include "DispatcherImpl.h"

namespace qelo::broker {

void Dispatcher::Impl::requireNameSpace(const cim::ObjectPath& path) const {
    if (!registry.hasNameSpace(path.nameSpace())) {
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
