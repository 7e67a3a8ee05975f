// A running `qelosim serve` on a free loopback port, and what it costs.
#pragma once

#include <cstdint>
#include <ctime>
#include <string>
#include <sys/types.h>
#include <vector>

namespace qelo::bench {

// The processors that this process may run on.
std::vector<int> usableCores();
// Keeps a thread and what it starts on one of them (0: the calling thread).
void pinTo(int core);

class ServerProcess {
public:
    static constexpr int anyCore = -1;

    // Starts it with these arguments and waits until it listens. Throws std::runtime_error
    // when it does not.
    explicit ServerProcess(const std::vector<std::string>& arguments, int core = anyCore);
    ~ServerProcess();
    ServerProcess(const ServerProcess&) = delete;
    ServerProcess& operator=(const ServerProcess&) = delete;

    std::uint16_t port() const { return port_; }

    // Processor time of all its threads since it began, kernel included.
    double cpuSeconds() const;

    // The most memory that was resident since forgetPeak(), in bytes.
    double peakMemory() const;
    void forgetPeak() const;

private:
    pid_t process_ = -1;
    clockid_t clock_ = 0;
    std::uint16_t port_ = 0;
};

} // namespace qelo::bench
