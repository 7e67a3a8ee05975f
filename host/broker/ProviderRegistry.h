// Which provider answers for a class in a namespace.
//
// Safe from several threads at once; shutDown() must not run while an operation does.
#pragma once

#include "Broker.h"
#include "Provider.h"
#include "Registration.h"

#include <memory>
#include <mutex>
#include <shared_mutex>
#include <string>
#include <vector>

namespace qelo::broker {

class ProviderRegistry {
public:
    // One registered class that serves a request.
    struct Target {
        Provider* provider;
        std::string className; // as it is registered
    };

    ProviderRegistry(const Broker& broker, std::vector<std::string> directories);

    // std::invalid_argument for an incomplete registration or one that contradicts another.
    void add(ProviderRegistration registration);
    std::vector<ProviderRegistration> registrations() const;

    // The providers of the class and of its subclasses, or else that of the nearest
    // superclass. Empty: none.
    std::vector<Target> serving(const std::string& nameSpace, const std::string& className,
                                ProviderType type) const;

    // The provider of the class itself, or else that of the nearest superclass; with a null
    // provider when there is none.
    Target serverOf(const std::string& nameSpace, const std::string& className,
                    ProviderType type) const;

    // The association providers of the namespace whose class passes the filter (empty: all).
    std::vector<Target> associations(const std::string& nameSpace,
                                     const std::string& assocClass) const;

    bool hasNameSpace(const std::string& nameSpace) const;

    // Whether the schema or a registration knows the class.
    bool hasClass(const std::string& nameSpace, const std::string& className) const;

    // The class name as the registrations spell it, if one has it, else as it is given.
    std::string registeredSpelling(const std::string& className) const;

    // One line of text for everything that cannot be loaded.
    std::vector<std::string> loadAll();

    // Cleans up and unloads the providers, the last registered first.
    void shutDown();

private:
    struct Entry {
        ProviderRegistration registration;
        Provider* provider;
    };

    Provider& providerFor(const ProviderRegistration& registration);
    bool serves(const Entry& entry, const std::string& nameSpace, ProviderType type) const;
    void refuseConflicts(const ProviderRegistration& registration) const;

    // The candidate that no other candidate is derived from.
    Target nearest(const std::string& nameSpace, const std::vector<Target>& candidates) const;
    std::vector<Target> superclassServers(const std::string& nameSpace,
                                          const std::string& className, ProviderType type) const;

    const Broker& broker_;
    const std::vector<std::string> directories_;
    std::recursive_mutex loading_;
    mutable std::shared_mutex mutex_;
    std::vector<Entry> entries_;
    std::vector<std::unique_ptr<Provider>> providers_;
};

// Namespaces compare ignoring case and slashes at both ends.
bool sameNameSpace(std::string_view left, std::string_view right);

} // namespace qelo::broker
