#include "ProviderLibrary.h"

#include <dlfcn.h>

#include <stdexcept>

namespace qelo::test {

namespace {

template <class MI>
MI* create(const ProviderLibrary& library, const std::string& provider, const char* type,
           const CMPIBroker* broker) {
    using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    void* address = library.function(provider + "_Create_" + type + "MI");
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return reinterpret_cast<Factory>(address)(broker, nullptr, &status);
}

} // namespace

ProviderLibrary::ProviderLibrary() : handle_(dlopen(path().c_str(), RTLD_NOW | RTLD_LOCAL)) {
    if (handle_ == nullptr) {
        throw std::runtime_error(dlerror());
    }
}

const ProviderLibrary& ProviderLibrary::instance() {
    static const ProviderLibrary library;
    return library;
}

std::string ProviderLibrary::path() { return QELO_PROVIDER_LIBRARY; }

void* ProviderLibrary::function(const std::string& name) const {
    void* address = dlsym(handle_, name.c_str());
    if (address == nullptr) {
        throw std::runtime_error("the provider library has no function " + name);
    }
    return address;
}

CMPIInstanceMI* ProviderLibrary::instanceMI(const std::string& provider,
                                            const CMPIBroker* broker) const {
    return create<CMPIInstanceMI>(*this, provider, "Instance", broker);
}

CMPIMethodMI* ProviderLibrary::methodMI(const std::string& provider,
                                        const CMPIBroker* broker) const {
    return create<CMPIMethodMI>(*this, provider, "Method", broker);
}

CMPIAssociationMI* ProviderLibrary::associationMI(const std::string& provider,
                                                  const CMPIBroker* broker) const {
    return create<CMPIAssociationMI>(*this, provider, "Association", broker);
}

} // namespace qelo::test
