// What is known about the computer system itself.
#pragma once

#include <string>

namespace qelo::computersystem {

struct SystemFacts {
    std::string name;            // as the platform names the system; never empty
    std::string operatingSystem; // for people, for example "Debian GNU/Linux 12 (bookworm)"
    std::string kernel;          // the kernel's name and release
};

// The facts of this machine, read afresh.
SystemFacts readSystemFacts();

// The value of one variable in the text of an os-release(5) file, unquoted; empty when it is
// not set.
std::string osReleaseValue(const std::string& text, const std::string& variable);

} // namespace qelo::computersystem
