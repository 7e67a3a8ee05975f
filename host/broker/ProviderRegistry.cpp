#include "ProviderRegistry.h"

#include <cim/ObjectPath.h>
#include <client/Connection.h>

#include <algorithm>
#include <stdexcept>

namespace qelo::broker {
namespace {

std::string_view trimmed(std::string_view nameSpace) {
    while (!nameSpace.empty() && nameSpace.front() == '/') {
        nameSpace.remove_prefix(1);
    }
    while (!nameSpace.empty() && nameSpace.back() == '/') {
        nameSpace.remove_suffix(1);
    }
    return nameSpace;
}

bool hasNameSpace(const ProviderRegistration& registration, const std::string& nameSpace) {
    const auto& names = registration.nameSpaces;
    return std::any_of(names.begin(), names.end(),
                       [&](const std::string& name) { return sameNameSpace(name, nameSpace); });
}

void requireComplete(const ProviderRegistration& registration) {
    const auto require = [&](bool given, const char* what) {
        if (!given) {
            throw std::invalid_argument("the registration of class \"" + registration.className +
                                        "\" has no " + what);
        }
    };
    require(!registration.className.empty(), "class");
    require(!registration.nameSpaces.empty(), "namespace");
    require(!registration.provider.empty(), "provider");
    require(!registration.library.empty(), "library");
    require(!registration.types.empty(), "provider type");
}

} // namespace

bool sameNameSpace(std::string_view left, std::string_view right) {
    return cim::sameName(trimmed(left), trimmed(right));
}

ProviderRegistry::ProviderRegistry(const Broker& broker, std::vector<std::string> directories)
    : broker_(broker), directories_(std::move(directories)) {}

void ProviderRegistry::refuseConflicts(const ProviderRegistration& registration) const {
    for (const Entry& entry : entries_) {
        if (!cim::sameName(entry.registration.className, registration.className)) {
            continue;
        }
        for (const std::string& nameSpace : registration.nameSpaces) {
            for (const ProviderType type : allProviderTypes) {
                if (registration.types.has(type) && serves(entry, nameSpace, type)) {
                    throw std::invalid_argument("class " + registration.className + " in " +
                                                nameSpace + " already has a provider of type " +
                                                providerTypeName(type) + ": " +
                                                entry.registration.provider);
                }
            }
        }
    }
}

Provider& ProviderRegistry::providerFor(const ProviderRegistration& registration) {
    for (const auto& provider : providers_) {
        if (provider->name() == registration.provider &&
            provider->library() == registration.library) {
            return *provider;
        }
    }
    providers_.push_back(std::make_unique<Provider>(broker_, directories_, loading_,
                                                    registration.library, registration.provider));
    return *providers_.back();
}

void ProviderRegistry::add(ProviderRegistration registration) {
    requireComplete(registration);
    const std::unique_lock lock(mutex_);
    refuseConflicts(registration);
    Provider& provider = providerFor(registration);
    provider.expect(registration.types);
    entries_.push_back({std::move(registration), &provider});
}

std::vector<ProviderRegistration> ProviderRegistry::registrations() const {
    const std::shared_lock lock(mutex_);
    std::vector<ProviderRegistration> list;
    for (const Entry& entry : entries_) {
        list.push_back(entry.registration);
    }
    return list;
}

bool ProviderRegistry::serves(const Entry& entry, const std::string& nameSpace,
                              ProviderType type) const {
    return entry.registration.types.has(type) &&
           broker::hasNameSpace(entry.registration, nameSpace);
}

std::vector<ProviderRegistry::Target>
ProviderRegistry::superclassServers(const std::string& nameSpace, const std::string& className,
                                    ProviderType type) const {
    std::vector<Target> targets;
    for (const Entry& entry : entries_) {
        if (serves(entry, nameSpace, type) &&
            broker_.isA(nameSpace, className, entry.registration.className)) {
            targets.push_back({entry.provider, entry.registration.className});
        }
    }
    return targets;
}

ProviderRegistry::Target ProviderRegistry::nearest(const std::string& nameSpace,
                                                   const std::vector<Target>& candidates) const {
    for (const Target& candidate : candidates) {
        const bool hasNearer =
            std::any_of(candidates.begin(), candidates.end(), [&](const Target& other) {
                return !cim::sameName(other.className, candidate.className) &&
                       broker_.isA(nameSpace, other.className, candidate.className);
            });
        if (!hasNearer) {
            return candidate;
        }
    }
    return {nullptr, {}};
}

std::vector<ProviderRegistry::Target> ProviderRegistry::serving(const std::string& nameSpace,
                                                                const std::string& className,
                                                                ProviderType type) const {
    const std::shared_lock lock(mutex_);
    std::vector<Target> targets;
    for (const Entry& entry : entries_) {
        if (serves(entry, nameSpace, type) &&
            broker_.isA(nameSpace, entry.registration.className, className)) {
            targets.push_back({entry.provider, entry.registration.className});
        }
    }
    if (!targets.empty()) {
        return targets;
    }
    Target above = nearest(nameSpace, superclassServers(nameSpace, className, type));
    if (!above.provider) {
        return {};
    }
    above.className = className; // the provider is asked for the subclass
    return {above};
}

ProviderRegistry::Target ProviderRegistry::serverOf(const std::string& nameSpace,
                                                    const std::string& className,
                                                    ProviderType type) const {
    const std::shared_lock lock(mutex_);
    return nearest(nameSpace, superclassServers(nameSpace, className, type));
}

std::vector<ProviderRegistry::Target>
ProviderRegistry::associations(const std::string& nameSpace, const std::string& assocClass) const {
    const std::shared_lock lock(mutex_);
    std::vector<Target> targets;
    for (const Entry& entry : entries_) {
        const std::string& served = entry.registration.className;
        if (!serves(entry, nameSpace, ProviderType::Association)) {
            continue;
        }
        if (assocClass.empty() || broker_.isA(nameSpace, served, assocClass)) {
            targets.push_back({entry.provider, served});
        } else if (broker_.isA(nameSpace, assocClass, served)) {
            targets.push_back({entry.provider, assocClass});
        }
    }
    return targets;
}

bool ProviderRegistry::hasNameSpace(const std::string& nameSpace) const {
    const std::shared_lock lock(mutex_);
    return std::any_of(entries_.begin(), entries_.end(), [&](const Entry& entry) {
        return broker::hasNameSpace(entry.registration, nameSpace);
    });
}

bool ProviderRegistry::hasClass(const std::string& nameSpace, const std::string& className) const {
    const auto& schemaHasClass = broker_.hooks().schema.hasClass;
    if (schemaHasClass && schemaHasClass(nameSpace, className)) {
        return true;
    }
    const std::shared_lock lock(mutex_);
    return std::any_of(entries_.begin(), entries_.end(), [&](const Entry& entry) {
        const std::string& served = entry.registration.className;
        return broker::hasNameSpace(entry.registration, nameSpace) &&
               (broker_.isA(nameSpace, served, className) ||
                broker_.isA(nameSpace, className, served));
    });
}

std::string ProviderRegistry::registeredSpelling(const std::string& className) const {
    const std::shared_lock lock(mutex_);
    for (const Entry& entry : entries_) {
        if (cim::sameName(entry.registration.className, className)) {
            return entry.registration.className;
        }
    }
    return className;
}

std::vector<std::string> ProviderRegistry::loadAll() {
    std::vector<Entry> entries;
    {
        const std::shared_lock lock(mutex_);
        entries = entries_;
    }
    std::vector<std::string> complaints;
    for (const Entry& entry : entries) {
        for (const ProviderType type : allProviderTypes) {
            if (!entry.registration.types.has(type)) {
                continue;
            }
            try {
                entry.provider->load(type, entry.registration.nameSpaces.front());
            } catch (const client::CimError& error) {
                complaints.push_back(entry.registration.className + ": " + error.what());
            }
        }
    }
    return complaints;
}

void ProviderRegistry::shutDown() {
    // Without the lock: a clean-up may ask other providers for something.
    std::vector<Provider*> providers;
    {
        const std::shared_lock lock(mutex_);
        for (auto provider = providers_.rbegin(); provider != providers_.rend(); ++provider) {
            providers.push_back(provider->get());
        }
    }
    for (Provider* provider : providers) {
        provider->cleanUp();
    }
    for (Provider* provider : providers) {
        provider->unload();
    }
}

} // namespace qelo::broker
