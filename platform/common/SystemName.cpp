#include "platform/TeskCommon.h"

#include <cstring>

#include <sys/utsname.h>

namespace Tesk {

// The node name is what the administrator gave the machine, the full name where it is one.
// No resolver is asked: that would let the network stall or name this system.
std::string getSystemName() {
    utsname names{};
    if (::uname(&names) != 0) {
        return "localhost";
    }
    const std::string name(names.nodename, ::strnlen(names.nodename, sizeof names.nodename));
    // A kernel whose name was never set answers "(none)".
    return name.empty() || name == "(none)" ? "localhost" : name;
}

} // namespace Tesk
