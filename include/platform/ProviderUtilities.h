// Checks that providers share (libqeloproviderutilities.so.1).
#pragma once

#include "PlatformApi.h"

#include <string>

namespace Tesk {

class QELO_PLATFORM_API ProviderUtilities {
public:
    // The gate on text arguments of methods: true when `value` may go into a command.
    // `extra` names further characters to refuse; an empty text adds none.
    static bool ValidateInput(const std::string& value, const std::string& extra);
};

} // namespace Tesk
