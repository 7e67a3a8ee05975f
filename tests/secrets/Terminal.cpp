#include "Terminal.h"

#include <array>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <poll.h>
#include <pty.h>
#include <stdexcept>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace qelo::secrets {
namespace {

constexpr int kPatience = 60'000; // milliseconds without a word

[[noreturn]] void becomeProgram(const std::vector<std::string>& command,
                                const endtoend::Variables& variables) {
    for (const auto& [name, value] : variables) {
        setenv(name.c_str(), value.c_str(), 1);
    }
    std::vector<char*> arguments;
    arguments.reserve(command.size() + 1);
    for (const std::string& argument : command) {
        arguments.push_back(const_cast<char*>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    execvp(arguments[0], arguments.data());
    _exit(127);
}

bool readSome(int terminal, std::string& text) {
    pollfd item = {terminal, POLLIN, 0};
    std::array<char, 4096> buffer{};
    const ssize_t got =
        poll(&item, 1, kPatience) == 1 ? read(terminal, buffer.data(), buffer.size()) : -1;
    if (got > 0) {
        text.append(buffer.data(), static_cast<std::size_t>(got));
    }
    return got > 0;
}

bool endsInQuestion(const std::string& text) {
    return text.size() >= 2 && text.compare(text.size() - 2, 2, ": ") == 0;
}

// The terminal is closed, so the program ends; one that has hung is ended.
int endOf(pid_t child) {
    int status = 0;
    for (int i = 0; i < 1000; ++i) {
        if (waitpid(child, &status, WNOHANG) == child) {
            return status;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    kill(child, SIGKILL);
    waitpid(child, &status, 0);
    return status;
}

} // namespace

endtoend::Finished runAndAnswer(const std::vector<std::string>& command,
                                const std::vector<std::string>& answers,
                                const endtoend::Variables& variables) {
    int terminal = -1;
    const pid_t child = forkpty(&terminal, nullptr, nullptr, nullptr);
    if (child < 0) {
        throw std::runtime_error("no terminal");
    }
    if (child == 0) {
        becomeProgram(command, variables);
    }
    endtoend::Finished result;
    std::size_t given = 0;
    std::size_t answered = 0; // up to here
    while (readSome(terminal, result.out)) {
        if (given < answers.size() && endsInQuestion(result.out) && result.out.size() > answered) {
            const std::string line = answers[given++] + "\n";
            answered = result.out.size();
            [[maybe_unused]] const ssize_t written = write(terminal, line.data(), line.size());
        }
    }
    const int status = endOf(child);
    close(terminal);
    result.status = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    return result;
}

} // namespace qelo::secrets
