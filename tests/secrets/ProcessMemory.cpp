#include "ProcessMemory.h"

#include <algorithm>
#include <chrono>
#include <fcntl.h>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <thread>
#include <unistd.h>
#include <vector>

namespace qelo::secrets {
namespace {

constexpr std::size_t kPiece = std::size_t{1} << 20U;

struct Region {
    std::size_t begin = 0;
    std::size_t end = 0;
    std::string line;
};

std::string fileOf(pid_t process, const std::string& name) {
    return "/proc/" + std::to_string(process) + "/" + name;
}

std::vector<Region> writableRegions(pid_t process) {
    std::ifstream maps(fileOf(process, "maps"));
    std::vector<Region> regions;
    for (std::string line; std::getline(maps, line);) {
        std::istringstream fields(line);
        Region region;
        char dash = 0;
        std::string rights;
        fields >> std::hex >> region.begin >> dash >> region.end >> rights;
        region.line = line;
        if (rights.compare(0, 2, "rw") == 0) {
            regions.push_back(std::move(region));
        }
    }
    return regions;
}

class Memory {
public:
    explicit Memory(pid_t process)
        : file_(open(fileOf(process, "mem").c_str(), O_RDONLY | O_CLOEXEC)) {
        if (file_ < 0) {
            throw std::runtime_error("the memory of the process cannot be read");
        }
    }
    ~Memory() { close(file_); }
    Memory(const Memory&) = delete;
    Memory& operator=(const Memory&) = delete;

    // What is there; shorter where the region has gone meanwhile.
    std::string read(std::size_t begin, std::size_t size) const {
        std::string bytes(size, '\0');
        const ssize_t got = pread(file_, bytes.data(), size, static_cast<off_t>(begin));
        bytes.resize(got > 0 ? static_cast<std::size_t>(got) : 0);
        return bytes;
    }

private:
    int file_;
};

// The bytes around a place, for whoever has to find out where they come from.
std::string surroundings(const std::string& bytes, std::size_t place) {
    const std::size_t begin = place - std::min<std::size_t>(place, 64);
    std::string text = bytes.substr(begin, 160);
    std::replace_if(
        text.begin(), text.end(), [](char c) { return c < ' ' || c > '~'; }, '.');
    return text;
}

void search(const std::string& bytes, const Region& region, std::size_t offset,
            const Password& password, std::string& found) {
    for (const auto& [name, form] : password.forms()) {
        const std::size_t place = bytes.find(form);
        if (place != std::string::npos) {
            std::ostringstream line;
            line << name << " at +" << std::hex << offset + place << " of " << region.line << ": "
                 << surroundings(bytes, place) << "\n";
            found += line.str();
        }
    }
}

} // namespace

std::string placesInMemory(pid_t process, const Password& password) {
    const Memory memory(process);
    std::string found;
    for (const Region& region : writableRegions(process)) {
        // The pieces overlap by more than any form is long.
        for (std::size_t begin = region.begin; begin < region.end; begin += kPiece) {
            const std::size_t size = std::min(kPiece + 1024, region.end - begin);
            search(memory.read(begin, size), region, begin - region.begin, password, found);
        }
    }
    return found;
}

std::string placesThatStay(pid_t process, const Password& password) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    std::string found = placesInMemory(process, password);
    while (!found.empty() && std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
        found = placesInMemory(process, password);
    }
    return found;
}

std::string processFile(pid_t process, const std::string& name) {
    std::ifstream file(fileOf(process, name), std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

} // namespace qelo::secrets
