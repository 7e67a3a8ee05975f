// Puts a text in the place of this process's standard input as long as it lives.
#pragma once

#include <stdexcept>
#include <string>

#include <unistd.h>

namespace qelo::cli {

class StandardInput {
public:
    // At most what a pipe holds.
    explicit StandardInput(const std::string& text) : before_(dup(STDIN_FILENO)) {
        int ends[2] = {-1, -1};
        if (pipe(ends) != 0) {
            throw std::runtime_error("no pipe");
        }
        const ssize_t written = write(ends[1], text.data(), text.size());
        close(ends[1]);
        dup2(ends[0], STDIN_FILENO);
        close(ends[0]);
        if (written != static_cast<ssize_t>(text.size())) {
            throw std::runtime_error("the text does not fit into a pipe");
        }
    }
    ~StandardInput() {
        if (before_ >= 0) {
            dup2(before_, STDIN_FILENO);
            close(before_);
        } else {
            close(STDIN_FILENO);
        }
    }
    StandardInput(const StandardInput&) = delete;
    StandardInput& operator=(const StandardInput&) = delete;

private:
    int before_;
};

} // namespace qelo::cli
