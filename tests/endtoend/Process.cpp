#include "Process.h"

#include <array>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <stdexcept>
#include <sys/wait.h>
#include <unistd.h>

namespace qelo::endtoend {
namespace {

constexpr std::chrono::seconds kPatience{120};

class Pipe {
public:
    Pipe() {
        if (pipe2(ends_.data(), O_CLOEXEC) != 0) {
            throw std::runtime_error("no pipe");
        }
    }
    ~Pipe() {
        closeEnd(0);
        closeEnd(1);
    }
    Pipe(const Pipe&) = delete;
    Pipe& operator=(const Pipe&) = delete;
    int reader() const { return ends_[0]; }
    int writer() const { return ends_[1]; }
    void closeWriter() { closeEnd(1); }
    void closeReader() { closeEnd(0); }

private:
    void closeEnd(std::size_t end) {
        if (ends_.at(end) >= 0) {
            close(ends_.at(end));
            ends_.at(end) = -1;
        }
    }
    std::array<int, 2> ends_{-1, -1};
};

// A pipe that holds `text` and has no writer any more.
void fill(Pipe& pipe, const std::string& text) {
    // Nobody reads yet, so more than fits would wait for ever.
    fcntl(pipe.writer(), F_SETFL, O_NONBLOCK);
    if (write(pipe.writer(), text.data(), text.size()) != static_cast<ssize_t>(text.size())) {
        throw std::runtime_error("the input does not fit into a pipe");
    }
    pipe.closeWriter();
}

struct Streams {
    int in;
    int out; // -1: closed
    int err;
};

[[noreturn]] void becomeProgram(const std::vector<std::string>& command, const Variables& variables,
                                const Streams& streams) {
    for (const auto& [name, value] : variables) {
        setenv(name.c_str(), value.c_str(), 1);
    }
    std::vector<char*> arguments;
    for (const std::string& argument : command) {
        arguments.push_back(const_cast<char*>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    (void)std::signal(SIGPIPE, SIG_DFL);
    dup2(streams.in, STDIN_FILENO);
    dup2(streams.err, STDERR_FILENO);
    if (streams.out >= 0) {
        dup2(streams.out, STDOUT_FILENO);
    } else {
        close(STDOUT_FILENO);
    }
    execvp(arguments[0], arguments.data());
    _exit(127);
}

// Reads what is there; false at the end of the stream.
bool readSome(int descriptor, std::string& text) {
    std::array<char, 65536> buffer{};
    const ssize_t got = read(descriptor, buffer.data(), buffer.size());
    if (got > 0) {
        text.append(buffer.data(), static_cast<std::size_t>(got));
    }
    return got > 0;
}

// Reads both streams until they end; false when that takes too long.
bool drain(Pipe& out, Pipe& err, Finished& result) {
    const auto deadline = std::chrono::steady_clock::now() + kPatience;
    while (out.reader() >= 0 || err.reader() >= 0) {
        std::array<pollfd, 2> entries{{{out.reader(), POLLIN, 0}, {err.reader(), POLLIN, 0}}};
        if (poll(entries.data(), entries.size(), 1000) < 0 ||
            std::chrono::steady_clock::now() > deadline) {
            return false;
        }
        if (entries[0].revents != 0 && !readSome(out.reader(), result.out)) {
            out.closeReader();
        }
        if (entries[1].revents != 0 && !readSome(err.reader(), result.err)) {
            err.closeReader();
        }
    }
    return true;
}

int waitFor(pid_t child) {
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

// Standard output is captured where `output` is null.
Finished run(const std::vector<std::string>& command, const Variables& variables,
             const std::string& input, const int* output) {
    Pipe in;
    fill(in, input);
    Pipe out;
    Pipe err;
    const pid_t child = fork();
    if (child < 0) {
        throw std::runtime_error("no process");
    }
    if (child == 0) {
        becomeProgram(command, variables,
                      {in.reader(), output == nullptr ? out.writer() : *output, err.writer()});
    }
    out.closeWriter();
    err.closeWriter();
    Finished result;
    if (drain(out, err, result)) {
        result.status = waitFor(child);
    } else {
        kill(child, SIGKILL);
        waitFor(child);
    }
    return result;
}

} // namespace

Finished runProcess(const std::vector<std::string>& command, const Variables& variables) {
    return run(command, variables, {}, nullptr);
}

Finished runProcessWithInput(const std::string& input, const std::vector<std::string>& command,
                             const Variables& variables) {
    return run(command, variables, input, nullptr);
}

Finished runProcessInto(int output, const std::vector<std::string>& command,
                        const Variables& variables) {
    return run(command, variables, {}, &output);
}

} // namespace qelo::endtoend
