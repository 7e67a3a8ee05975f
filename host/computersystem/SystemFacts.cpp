#include "SystemFacts.h"

#include <platform/TeskCommon.h>

#include <fstream>
#include <iterator>
#include <sstream>
#include <sys/utsname.h>

namespace qelo::computersystem {
namespace {

constexpr std::streamsize longestFile = 65536;

// The beginning of a file, or nothing.
std::string readText(const char* path) {
    std::ifstream file(path, std::ios::binary);
    std::string text(longestFile, '\0');
    file.read(text.data(), longestFile);
    text.resize(static_cast<std::size_t>(file.gcount()));
    return text;
}

// A shell word as os-release(5) allows it: quotes go, a backslash keeps the next character.
std::string unquoted(const std::string& word) {
    std::string value;
    for (std::size_t i = 0; i < word.size(); ++i) {
        if (word[i] == '\\' && i + 1 < word.size()) {
            value += word[++i];
        } else if (word[i] != '"' && word[i] != '\'') {
            value += word[i];
        }
    }
    return value;
}

std::string operatingSystemName(const std::string& kernelName) {
    for (const char* path : {"/etc/os-release", "/usr/lib/os-release"}) {
        std::string name = osReleaseValue(readText(path), "PRETTY_NAME");
        if (!name.empty()) {
            return name;
        }
    }
    return kernelName;
}

} // namespace

std::string osReleaseValue(const std::string& text, const std::string& variable) {
    std::istringstream lines(text);
    const std::string start = variable + "=";
    std::string value;
    for (std::string line; std::getline(lines, line);) {
        if (line.compare(0, start.size(), start) == 0) {
            value = unquoted(line.substr(start.size())); // the last one counts
        }
    }
    return value;
}

SystemFacts readSystemFacts() {
    struct utsname kernel = {};
    uname(&kernel);
    const std::string kernelName = kernel.sysname;
    return {Tesk::getSystemName(), operatingSystemName(kernelName),
            kernelName + " " + kernel.release};
}

} // namespace qelo::computersystem
