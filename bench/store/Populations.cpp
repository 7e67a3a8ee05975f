#include "Populations.h"

#include <cstdlib>
#include <fstream>
#include <stdexcept>

namespace qelo::bench {

namespace {

namespace fs = std::filesystem;

constexpr int membersPerGroup = 10;

std::string nameOf(int account) { return "user" + std::to_string(100'000 + account); }

void writeAccounts(const fs::path& etc, int accounts) {
    std::ofstream passwd(etc / "passwd");
    std::ofstream shadow(etc / "shadow");
    for (int i = 0; i < accounts; ++i) {
        const std::string name = nameOf(i);
        passwd << name << ":x:" << 1000 + i << ":100:Person " << i << ",,,:/home/" << name
               << ":/bin/bash\n";
        shadow << name << ":$y$j9T$abcdefghijklmnopqrstuv$ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklm:"
               << "19700:0:99999:7:::\n";
    }
}

void writeGroups(const fs::path& etc, int groups) {
    std::ofstream group(etc / "group");
    for (int i = 0; i < groups; ++i) {
        group << "group" << i << ":x:" << 1000 + i << ":";
        for (int member = 0; member < membersPerGroup; ++member) {
            group << (member ? "," : "") << nameOf(i * membersPerGroup + member);
        }
        group << "\n";
    }
}

void writeNodes(const fs::path& file, int accounts) {
    std::ofstream out(file);
    out << R"({"nodes":[{"type":17,"path":"/UserAdministration/1"})";
    for (int i = 0; i < accounts; ++i) {
        const std::string name = nameOf(i);
        out << ",\n{\"type\":46,\"path\":\"/UserAdministration/1/UserAccount/" << name
            << "\",\"properties\":{\"108\":\"" << name << "\",\"89\":\"" << 1000 + i
            << R"(","311":"100","312":"Person )" << i << R"(","158":"/home/)" << name
            << R"(","159":"/bin/bash","123":1,"160":"2023-12-09 00:00:00","161":0,"162":7,)"
            << R"("163":99999}})";
    }
    out << "]}\n";
}

} // namespace

Population::Population(int accounts) {
    std::string name = (fs::temp_directory_path() / "storebench-XXXXXX").string();
    if (!::mkdtemp(name.data())) {
        throw std::runtime_error("no scratch directory");
    }
    root_ = name;
    fs::create_directories(root_ / "etc");
    writeAccounts(root_ / "etc", accounts);
    writeGroups(root_ / "etc", accounts / membersPerGroup);
    writeNodes(root_ / "nodes.json", accounts);
}

Population::~Population() {
    std::error_code ignored;
    fs::remove_all(root_, ignored);
}

} // namespace qelo::bench
