// A directory of a test's own, and the small things tests do with files in it.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace qelo::test {

class Scratch {
public:
    Scratch() {
        std::string name = (std::filesystem::temp_directory_path() / "logging.XXXXXX").string();
        if (::mkdtemp(name.data()) == nullptr) {
            throw std::runtime_error("no scratch directory");
        }
        path_ = name;
    }
    ~Scratch() {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }
    Scratch(const Scratch&) = delete;
    Scratch& operator=(const Scratch&) = delete;

    std::string at(const std::string& name) const { return (path_ / name).string(); }

private:
    std::filesystem::path path_;
};

// The file is written apart and moved into place, so that no reader sees a half of it.
inline void writeFile(const std::string& path, const std::string& text) {
    std::ofstream(path + ".new") << text;
    std::filesystem::rename(path + ".new", path);
}

inline std::string readFile(const std::string& path) {
    std::ostringstream text;
    text << std::ifstream(path).rdbuf();
    return text.str();
}

inline std::vector<std::string> linesOf(const std::string& path) {
    std::ifstream file(path);
    std::vector<std::string> lines;
    for (std::string line; std::getline(file, line);) {
        lines.push_back(line);
    }
    return lines;
}

} // namespace qelo::test
