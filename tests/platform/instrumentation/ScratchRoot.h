// A root directory of its own for a test, removed with its owner.
#pragma once

#include <filesystem>
#include <string>

namespace qelo::nodes::tests {

class ScratchRoot {
public:
    ScratchRoot();
    ~ScratchRoot();
    ScratchRoot(const ScratchRoot&) = delete;
    ScratchRoot& operator=(const ScratchRoot&) = delete;

    const std::filesystem::path& path() const { return path_; }
    std::string choice() const { return "accounts:" + path_.string(); }

    // Writes a file below the root, with its directories.
    std::filesystem::path write(const std::string& name, const std::string& content) const;
    void append(const std::string& name, const std::string& content) const;

    // As the system's tools do: a new file is moved into the place of the old one.
    void replace(const std::string& name, const std::string& content) const;

private:
    std::filesystem::path path_;
};

// Sets an environment variable for the time of a test.
class ScopedVariable {
public:
    ScopedVariable(const char* name, const std::string& value);
    ~ScopedVariable();
    ScopedVariable(const ScopedVariable&) = delete;
    ScopedVariable& operator=(const ScopedVariable&) = delete;

private:
    const char* name_;
};

} // namespace qelo::nodes::tests
