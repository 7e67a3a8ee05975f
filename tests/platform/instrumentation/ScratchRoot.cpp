#include "ScratchRoot.h"

#include <cstdlib>
#include <fstream>
#include <stdexcept>

namespace qelo::nodes::tests {

namespace fs = std::filesystem;

ScratchRoot::ScratchRoot() {
    std::string name = (fs::temp_directory_path() / "nodestore-XXXXXX").string();
    if (!::mkdtemp(name.data())) {
        throw std::runtime_error("no scratch directory");
    }
    path_ = name;
    fs::create_directories(path_ / "etc/security");
}

ScratchRoot::~ScratchRoot() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
}

fs::path ScratchRoot::write(const std::string& name, const std::string& content) const {
    const fs::path file = path_ / name;
    fs::create_directories(file.parent_path());
    std::ofstream(file, std::ios::binary | std::ios::trunc) << content;
    return file;
}

void ScratchRoot::append(const std::string& name, const std::string& content) const {
    std::ofstream(path_ / name, std::ios::binary | std::ios::app) << content;
}

void ScratchRoot::replace(const std::string& name, const std::string& content) const {
    fs::rename(write(name + "+", content), path_ / name);
}

ScopedVariable::ScopedVariable(const char* name, const std::string& value) : name_(name) {
    ::setenv(name, value.c_str(), 1);
}

ScopedVariable::~ScopedVariable() { ::unsetenv(name_); }

} // namespace qelo::nodes::tests
