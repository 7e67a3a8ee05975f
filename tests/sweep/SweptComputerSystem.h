// The provider of computer systems, which is a library of its own.
#pragma once

#include "SweptLibrary.h"

namespace qelo::test {

// By the name it is registered under.
inline constexpr const char* sweptComputerSystem = "QeloComputerSystemProvider";

// Its interfaces, using that broker from then on.
Interfaces computerSystemInterfaces(const CMPIBroker* broker);

} // namespace qelo::test
