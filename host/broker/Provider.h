// One provider: a name in a library, with up to one management interface of each type. The
// library is loaded and the interfaces are made when the first of them is asked for; what
// failed is tried again when it is asked for again.
//
// All registered interfaces are made before the first is used, because every factory of a
// provider commonly writes the same variable that its operations read.
//
// Asking is safe from several threads at once. Cleaning up and unloading are not.
#pragma once

#include "Broker.h"
#include "Registration.h"
#include "SharedLibrary.h"

#include <cmpi/cmpift.h>

#include <array>
#include <atomic>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace qelo::broker {

class Provider {
public:
    // One mutex serves all providers of a broker: a factory may make up-calls that load
    // other providers, in any order.
    Provider(const Broker& broker, const std::vector<std::string>& directories,
             std::recursive_mutex& loading, std::string library, std::string name);

    // Types that are registered for this provider.
    void expect(ProviderTypes types);

    const std::string& library() const { return libraryName_; }
    const std::string& name() const { return name_; }

    // The management interface. `nameSpace` is told to the factory. Throws CimError when the
    // library, the factory or the interface cannot be had, when called from the factory of
    // that very interface, and between cleanUp() and unload().
    CMPIInstanceMI* instanceMI(const std::string& nameSpace);
    CMPIAssociationMI* associationMI(const std::string& nameSpace);
    CMPIMethodMI* methodMI(const std::string& nameSpace);
    CMPIPropertyMI* propertyMI(const std::string& nameSpace);
    CMPIIndicationMI* indicationMI(const std::string& nameSpace);

    // The same for a type given at run time.
    void load(ProviderType type, const std::string& nameSpace);

    // Calls the clean-up of every interface that was made. The library stays until unload(),
    // and no interface can be had until then.
    void cleanUp();

    // Unloads the library, unless a clean-up asked for it to stay.
    void unload();

private:
    template <class MI> MI* interface(ProviderType type, const std::string& nameSpace);
    template <class MI> MI* create(ProviderType type, const std::string& nameSpace);
    void makeCompanions(const std::string& nameSpace);
    void publish();
    template <class MI> void cleanUp(ProviderType type);
    [[noreturn]] void fail(CMPIrc code, const std::string& text) const;

    const Broker& broker_;
    const std::vector<std::string>& directories_;
    std::recursive_mutex& loading_;
    std::string libraryName_;
    std::string name_;
    std::unique_ptr<SharedLibrary> library_;
    std::array<std::atomic<void*>, providerTypeCount> interfaces_ = {}; // ready for use
    std::atomic<unsigned int> expected_{0};                             // a bit per type

    // The rest belongs to who holds loading_.
    std::array<void*, providerTypeCount> made_ = {}; // not all are ready for others yet
    std::array<bool, providerTypeCount> beingMade_ = {};
    int makers_ = 0; // nested calls that are making interfaces
    bool companionsMade_ = false;
    bool stopped_ = false;
};

} // namespace qelo::broker
