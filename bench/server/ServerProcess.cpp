#include "ServerProcess.h"

#include "Clock.h"

#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <fstream>
#include <sched.h>
#include <stdexcept>
#include <sys/wait.h>
#include <unistd.h>

namespace qelo::bench {
namespace {

[[noreturn]] void become(std::vector<std::string> command, int output, int core) {
    if (core != ServerProcess::anyCore) {
        pinTo(core);
    }
    std::vector<char*> pointers;
    pointers.reserve(command.size() + 1);
    for (std::string& text : command) {
        pointers.push_back(text.data());
    }
    pointers.push_back(nullptr);
    dup2(output, STDOUT_FILENO);
    execv(pointers[0], pointers.data());
    _exit(127);
}

// Up to the end of the first line.
std::string readLine(int descriptor) {
    std::string line;
    char c = 0;
    while (read(descriptor, &c, 1) == 1 && c != '\n') {
        line += c;
    }
    return line;
}

} // namespace

std::vector<int> usableCores() {
    cpu_set_t set;
    CPU_ZERO(&set);
    sched_getaffinity(0, sizeof set, &set);
    std::vector<int> cores;
    for (int core = 0; core < CPU_SETSIZE; ++core) {
        if (CPU_ISSET(static_cast<unsigned int>(core), &set)) {
            cores.push_back(core);
        }
    }
    return cores;
}

void pinTo(int core) {
    cpu_set_t set;
    CPU_ZERO(&set);
    CPU_SET(static_cast<unsigned int>(core), &set);
    sched_setaffinity(0, sizeof set, &set);
}

ServerProcess::ServerProcess(const std::vector<std::string>& arguments, int core) {
    std::vector<std::string> command = {QELOSIM, "serve", "--no-auth", "--listen", "127.0.0.1:0"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    int output[2];
    if (pipe2(output, O_CLOEXEC) != 0) {
        throw std::runtime_error("no pipe");
    }
    process_ = fork();
    if (process_ == 0) {
        become(std::move(command), output[1], core);
    }
    close(output[1]);
    const std::string line = readLine(output[0]);
    close(output[0]);
    const std::size_t colon = line.rfind(':');
    port_ = colon == std::string::npos
                ? std::uint16_t{0}
                : static_cast<std::uint16_t>(std::strtoul(line.c_str() + colon + 1, nullptr, 10));
    if (port_ == 0 || clock_getcpuclockid(process_, &clock_) != 0) {
        throw std::runtime_error("the server does not start");
    }
}

ServerProcess::~ServerProcess() {
    kill(process_, SIGTERM);
    waitpid(process_, nullptr, 0);
}

double ServerProcess::cpuSeconds() const { return secondsOf(clock_); }

double ServerProcess::peakMemory() const {
    std::ifstream status("/proc/" + std::to_string(process_) + "/status");
    const std::string name = "VmHWM:";
    for (std::string line; std::getline(status, line);) {
        if (line.compare(0, name.size(), name) == 0) {
            constexpr double kibibyte = 1024;
            return std::stod(line.substr(name.size())) * kibibyte;
        }
    }
    throw std::runtime_error("the server's memory is not told");
}

void ServerProcess::forgetPeak() const {
    std::ofstream("/proc/" + std::to_string(process_) + "/clear_refs") << "5";
}

} // namespace qelo::bench
