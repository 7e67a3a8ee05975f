#include "SharedLibrary.h"

#include <algorithm>
#include <dlfcn.h>
#include <unistd.h>

namespace qelo::broker {
namespace {

std::string loaderError() {
    const char* text = dlerror();
    return text ? text : "unknown error of the loader";
}

bool isPlainName(const std::string& name) {
    const auto isControl = [](unsigned char c) { return c < 0x20; };
    return !name.empty() && name.find('/') == std::string::npos &&
           name.find("..") == std::string::npos &&
           std::none_of(name.begin(), name.end(), isControl);
}

std::string joined(const std::vector<std::string>& directories) {
    std::string text;
    for (const std::string& directory : directories) {
        text += (text.empty() ? "" : ", ") + directory;
    }
    return text.empty() ? "no directory at all" : text;
}

} // namespace

std::string findLibrary(const std::string& name, const std::vector<std::string>& directories) {
    if (!name.empty() && name.front() == '/') {
        return name;
    }
    if (!isPlainName(name)) {
        throw LibraryError("\"" + name + "\" is neither a library name nor an absolute path");
    }
    for (const std::string& directory : directories) {
        for (const char* suffix : {".so", ".so.1"}) {
            std::string path = directory;
            path.append("/lib").append(name).append(suffix);
            if (access(path.c_str(), F_OK) == 0) {
                return path;
            }
        }
    }
    throw LibraryError("there is no lib" + name + ".so or lib" + name + ".so.1 in " +
                       joined(directories));
}

SharedLibrary::SharedLibrary(const std::string& path)
    : path_(path), handle_(dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL)) {
    if (!handle_) {
        throw LibraryError(loaderError());
    }
}

SharedLibrary::~SharedLibrary() {
    if (!keep_) {
        dlclose(handle_);
    }
}

void* SharedLibrary::symbol(const std::string& name) const { return dlsym(handle_, name.c_str()); }

} // namespace qelo::broker
