#include "Terminal.h"

#include <array>
#include <cstdlib>
#include <fcntl.h>
#include <stdexcept>
#include <sys/ioctl.h>
#include <thread>
#include <unistd.h>

namespace qelo::endtoend {
namespace {

struct Pair {
    explicit Pair(std::size_t columns) : master(posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC)) {
        std::array<char, 128> name{};
        if (master < 0 || grantpt(master) != 0 || unlockpt(master) != 0 ||
            ptsname_r(master, name.data(), name.size()) != 0) {
            throw std::runtime_error("no terminal");
        }
        slave = open(name.data(), O_RDWR | O_NOCTTY | O_CLOEXEC);
        winsize size{};
        size.ws_col = static_cast<unsigned short>(columns);
        size.ws_row = 24;
        ioctl(slave, TIOCSWINSZ, &size);
    }
    int master;
    int slave = -1;
};

std::string withoutReturns(const std::string& text) {
    std::string result;
    for (const char c : text) {
        if (c != '\r') {
            result += c;
        }
    }
    return result;
}

} // namespace

Finished runOnTerminal(std::size_t columns, const std::vector<std::string>& command,
                       const Variables& variables) {
    Pair pair(columns);
    std::string seen;
    std::thread reader([&] {
        std::array<char, 4096> buffer{};
        for (ssize_t got = 0; (got = read(pair.master, buffer.data(), buffer.size())) > 0;) {
            seen.append(buffer.data(), static_cast<std::size_t>(got));
        }
    });
    Finished result = runProcessInto(pair.slave, command, variables);
    close(pair.slave); // the last one: the reader sees the end
    reader.join();
    close(pair.master);
    result.out = withoutReturns(seen);
    return result;
}

} // namespace qelo::endtoend
