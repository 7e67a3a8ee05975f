#include "SweptComputerSystem.h"

#include <dlfcn.h>

#include <stdexcept>
#include <string>

namespace qelo::test {

namespace {

void* factory() {
    void* const library = ::dlopen(QELO_COMPUTER_SYSTEM_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    const std::string name = std::string(sweptComputerSystem) + "_Create_InstanceMI";
    void* const address = library == nullptr ? nullptr : ::dlsym(library, name.c_str());
    if (address == nullptr) {
        throw std::runtime_error(::dlerror());
    }
    return address;
}

} // namespace

Interfaces computerSystemInterfaces(const CMPIBroker* broker) {
    using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    static const auto create = reinterpret_cast<Factory>(factory());
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    Interfaces interfaces;
    interfaces.instances = create(broker, nullptr, &status);
    return interfaces;
}

} // namespace qelo::test
