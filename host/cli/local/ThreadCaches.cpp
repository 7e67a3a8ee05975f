#include "ThreadCaches.h"

#include <climits>
#include <cstdlib>
#include <fstream>
#include <string>
#include <sys/auxv.h>
#include <unistd.h>
#include <vector>

namespace qelo::cli {
namespace {

constexpr const char* kVariable = "GLIBC_TUNABLES";
constexpr const char* kSetting = "glibc.malloc.tcache_max";

// The arguments of this process; none when they cannot be read.
std::vector<std::string> ownArguments() {
    std::ifstream file("/proc/self/cmdline", std::ios::binary);
    std::vector<std::string> arguments;
    for (std::string argument; std::getline(file, argument, '\0');) {
        arguments.push_back(argument);
    }
    return arguments;
}

// By its name, as the list of processes would show "exe" otherwise.
std::string ownProgram() {
    std::string path(PATH_MAX, '\0');
    const ssize_t length = readlink("/proc/self/exe", path.data(), path.size());
    path.resize(length < 0 ? 0 : static_cast<std::size_t>(length));
    return path;
}

} // namespace

void limitThreadCaches() {
    const char* const set = std::getenv(kVariable);
    const std::string tunables = set != nullptr ? set : "";
    // A program that runs with other rights than its user's starts without the variable.
    if (tunables.find(kSetting) != std::string::npos || getauxval(AT_SECURE) != 0) {
        return;
    }
    const std::string program = ownProgram();
    std::vector<std::string> texts = ownArguments();
    if (program.empty() || texts.empty()) {
        return;
    }
    std::vector<char*> arguments;
    arguments.reserve(texts.size() + 1);
    for (std::string& text : texts) {
        arguments.push_back(text.data());
    }
    arguments.push_back(nullptr);
    const std::string more = (tunables.empty() ? "" : tunables + ":") + kSetting + "=256";
    if (setenv(kVariable, more.c_str(), 1) == 0) {
        (void)execv(program.c_str(), arguments.data());
        // As a server with larger caches, then.
    }
}

} // namespace qelo::cli
