// Passwords from the person or program in front of the command.
#pragma once

#include <string>

namespace qelo::cli {

// A text that is wiped when it goes.
class Password {
public:
    explicit Password(std::string text) : text_(std::move(text)) {}
    ~Password();
    Password(Password&& other) noexcept : text_(std::move(other.text_)) {}
    Password(const Password&) = delete;
    Password& operator=(const Password&) = delete;
    Password& operator=(Password&&) = delete;

    const std::string& text() const { return text_; }

private:
    std::string text_;
};

// The first line of standard input, without its line end. Throws UsageError when there is
// none, or one that no password can be (over 1 KiB, or with a NUL in it).
Password passwordFromInput();

// The first line of a file; UsageError as above, or when it cannot be read.
Password passwordFromFile(const std::string& file);

// Asked for once on the terminal, without echo. UsageError when there is no terminal.
Password passwordForServer(const std::string& user, const std::string& server);

// Asked for twice on the terminal, without echo. Throws UsageError when there is no terminal
// or the two differ.
Password passwordFromTerminal(const std::string& account);

} // namespace qelo::cli
