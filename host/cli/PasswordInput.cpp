#include "PasswordInput.h"

#include "CommandContext.h"
#include "render/Display.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <system_error>
#include <termios.h>
#include <unistd.h>

namespace qelo::cli {
namespace {

constexpr std::size_t kLongestPassword = 1024;

// An open terminal whose echo is off as long as this lives.
class SilentTerminal {
public:
    // `instead`: the option for those who have no terminal.
    explicit SilentTerminal(const std::string& instead)
        : descriptor_(open("/dev/tty", O_RDWR | O_CLOEXEC | O_NOCTTY)) {
        if (descriptor_ < 0 || tcgetattr(descriptor_, &before_) != 0) {
            close();
            throw UsageError("there is no terminal to ask for the password; use " + instead);
        }
        termios silent = before_;
        silent.c_lflag &= ~static_cast<tcflag_t>(ECHO);
        tcsetattr(descriptor_, TCSAFLUSH, &silent);
    }
    ~SilentTerminal() {
        tcsetattr(descriptor_, TCSAFLUSH, &before_);
        close();
    }
    SilentTerminal(const SilentTerminal&) = delete;
    SilentTerminal& operator=(const SilentTerminal&) = delete;

    int descriptor() const { return descriptor_; }

    void say(const std::string& text) const {
        [[maybe_unused]] const ssize_t written = ::write(descriptor_, text.data(), text.size());
    }

private:
    void close() const {
        if (descriptor_ >= 0) {
            ::close(descriptor_);
        }
    }

    int descriptor_;
    termios before_ = {};
};

class Descriptor {
public:
    explicit Descriptor(int number) : number_(number) {}
    ~Descriptor() { ::close(number_); }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

private:
    int number_;
};

// One line. Read a byte at a time, so that nothing behind the line is taken.
Password readLine(int descriptor) {
    std::array<char, kLongestPassword> line = {};
    std::size_t length = 0;
    bool complete = false;
    while (!complete && length < line.size() && ::read(descriptor, &line[length], 1) == 1) {
        complete = line[length] == '\n';
        length += complete ? 0 : 1;
    }
    Password password(std::string(line.data(), length));
    explicit_bzero(line.data(), line.size());
    if (length == kLongestPassword || password.text().find('\0') != std::string::npos) {
        throw UsageError("what was given cannot be a password");
    }
    if (length == 0) {
        throw UsageError("no password was given");
    }
    return password;
}

} // namespace

Password::~Password() { explicit_bzero(text_.data(), text_.size()); }

Password passwordFromInput() { return readLine(STDIN_FILENO); }

Password passwordFromFile(const std::string& file) {
    const int descriptor = open(file.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY);
    if (descriptor < 0) {
        throw UsageError("cannot read " + file + ": " + std::generic_category().message(errno));
    }
    const Descriptor owner(descriptor);
    return readLine(descriptor);
}

Password passwordForServer(const std::string& user, const std::string& server) {
    const SilentTerminal terminal("--password-file");
    terminal.say("Password of " + displayText(user) + " at " + displayText(server) + ": ");
    Password password = readLine(terminal.descriptor());
    terminal.say("\n");
    return password;
}

Password passwordFromTerminal(const std::string& account) {
    const SilentTerminal terminal("--password-stdin");
    terminal.say("New password for " + account + ": ");
    Password first = readLine(terminal.descriptor());
    terminal.say("\nOnce more: ");
    const Password second = readLine(terminal.descriptor());
    terminal.say("\n");
    if (first.text() != second.text()) {
        throw UsageError("the two passwords differ");
    }
    return first;
}

} // namespace qelo::cli
