// What this process shows of itself to others on the same machine.
#pragma once

#include <string>
#include <vector>

namespace qelo::secrecy {

// No core image of this process is ever written, neither to a file nor to a program, and only
// the superuser may look into it. Programs that it starts begin anew in both but stay without
// core files.
void keepMemoryPrivate();

// A copy of the arguments of the program. In their own place, which everybody can read in the list
// of processes, each character of what may be a password is an "x" from then on: the value of an
// argument named `UserPassword`, and what stands behind the user of a URL.
std::vector<std::string> hideSecrets(int count, char** arguments);

} // namespace qelo::secrecy
