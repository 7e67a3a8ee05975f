// Who may log in. Behind an interface, so that the accounts of the machine (PAM) and a file
// of users can take each other's place.
#pragma once

#include <memory>
#include <string>

namespace qelo::server {

class PasswordChecker {
public:
    virtual ~PasswordChecker() = default;

    // Whether this is the user's password and the user may log in. May take seconds; safe
    // from several threads at once. Keeps no copy of the password. False, too, when the check
    // cannot be made at all.
    virtual bool check(const std::string& user, const std::string& password) const = 0;
};

// The accounts of this machine through PAM (Linux-PAM), authentication and account phase, as
// /etc/pam.d/`service` says. PAM's own delay after a wrong password is switched off, because
// it would occupy the calling thread.
std::unique_ptr<PasswordChecker> pamChecker(const std::string& service);

// A file of lines "user:hash" with hashes as crypt(3) makes them; empty lines and lines that
// begin with "#" do not count. The file is read afresh for each check. Throws
// std::runtime_error, naming the line, when it cannot be read or is damaged, or when others
// than its owner may write it.
std::unique_ptr<PasswordChecker> userFileChecker(const std::string& path);

} // namespace qelo::server
