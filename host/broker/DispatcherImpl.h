// What the parts of the dispatcher share.
#pragma once

#include "Dispatcher.h"

#include "Broker.h"
#include "ProviderCall.h"
#include "ProviderRegistry.h"

#include <functional>

namespace qelo::broker {

class Dispatcher::Impl {
public:
    using Target = ProviderRegistry::Target;

    Impl(Router& router, DispatcherOptions options)
        : broker(router, std::move(options.hooks)),
          registry(broker, std::move(options.libraryDirectories)) {}

    // CimError when no class is registered there.
    void requireNameSpace(const cim::ObjectPath& path) const;

    // CimError when the namespace or the class is not known at all.
    void requireClass(const cim::ObjectPath& path) const;

    // The provider that serves the class of `path`; CimError with `code` when the class has
    // none of that type.
    Target requireServer(const cim::ObjectPath& path, ProviderType type, CMPIrc code) const;

    // The association providers to ask about the object at `path`.
    std::vector<Target> associationTargets(const cim::ObjectPath& path,
                                           const std::string& assocClass) const;

    // `path` with its class spelled as registered, so that providers may compare exactly.
    cim::ObjectPath spelled(const cim::ObjectPath& path) const;

    // The static instances of a class and its subclasses, those of classes that have no
    // provider.
    std::vector<const cim::Instance*> staticInstances(const cim::ObjectPath& classPath) const;

    // Asks each target in turn. One that does not support the operation, or finds nothing,
    // does not spoil the answers of the others; it is an error only for a single target that
    // does not support it.
    void askAll(const std::vector<Target>& targets,
                const std::function<void(const Target&)>& ask) const;

    Broker broker;
    ProviderRegistry registry;
};

// The instance with the named properties only, if there is a list.
cim::Instance withOnly(const cim::Instance& instance, const client::PropertyList& properties);

// Runs an operation; a refusal from inside the broker comes out as CimError.
template <class Operation> auto asOperation(Operation operation) {
    try {
        return operation();
    } catch (const Refusal& refusal) {
        const unsigned int code = cimStatusCode(refusal.code);
        throw client::CimError(code, refusal.text.empty() ? statusName(code) : refusal.text);
    }
}

// A table's slot that the provider left empty answers like one that supports nothing.
inline CMPIStatus noSuchSlot() { return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr}; }

} // namespace qelo::broker
