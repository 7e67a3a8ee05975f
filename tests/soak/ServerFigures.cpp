#include "ServerFigures.h"

#include <chrono>
#include <filesystem>
#include <fstream>
#include <string>
#include <thread>

namespace qelo::soak {
namespace {

std::string directoryOf(pid_t process) { return "/proc/" + std::to_string(process); }

std::size_t numberIn(pid_t process, const std::string& field) {
    std::ifstream status(directoryOf(process) + "/status");
    for (std::string line; std::getline(status, line);) {
        if (line.compare(0, field.size(), field) == 0) {
            return std::stoul(line.substr(field.size()));
        }
    }
    return 0;
}

std::optional<std::size_t> descriptorsOf(pid_t process) {
    std::error_code error;
    std::size_t count = 0;
    for (std::filesystem::directory_iterator entry(directoryOf(process) + "/fd", error), end;
         !error && entry != end; entry.increment(error)) {
        ++count;
    }
    return error ? std::nullopt : std::optional(count);
}

} // namespace

std::ostream& operator<<(std::ostream& stream, const ServerFigures& figures) {
    stream << figures.residentKiB << " KiB, " << figures.threads << " threads, ";
    return figures.descriptors ? stream << *figures.descriptors << " descriptors"
                               : stream << "descriptors not to be seen";
}

ServerFigures figuresOf(pid_t process) {
    return {numberIn(process, "VmRSS:"), numberIn(process, "Threads:"), descriptorsOf(process)};
}

ServerFigures figuresAtRest(pid_t process, std::optional<std::size_t> descriptors) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::minutes(1);
    ServerFigures before = figuresOf(process);
    while (std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(std::chrono::seconds(7));
        const ServerFigures now = figuresOf(process);
        if (now.residentKiB == before.residentKiB &&
            now.descriptors.value_or(0) <= descriptors.value_or(0)) {
            return now;
        }
        before = now;
    }
    return before;
}

} // namespace qelo::soak
