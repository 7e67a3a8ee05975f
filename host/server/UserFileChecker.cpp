#include "PasswordChecker.h"

#include <crypt.h>

#include <cerrno>
#include <cstring>
#include <fstream>
#include <map>
#include <stdexcept>
#include <sys/stat.h>
#include <system_error>

namespace qelo::server {
namespace {

// Checked for users who do not exist, so that the time it takes does not tell who does.
constexpr char kNobodysHash[] = "$6$qelosimnobody$";

[[noreturn]] void refuse(const std::string& path, std::size_t line, const std::string& problem) {
    throw std::runtime_error(path + ":" + std::to_string(line) + ": " + problem);
}

void requireUnwritableByOthers(const std::string& path) {
    struct stat status = {};
    if (stat(path.c_str(), &status) != 0) {
        throw std::runtime_error("cannot read " + path + ": " +
                                 std::generic_category().message(errno));
    }
    if ((status.st_mode & (S_IWGRP | S_IWOTH)) != 0) {
        throw std::runtime_error(path + " may be written by others than its owner");
    }
}

std::map<std::string, std::string> readUsers(const std::string& path) {
    requireUnwritableByOthers(path);
    std::ifstream file(path);
    std::map<std::string, std::string> users;
    std::string text;
    for (std::size_t line = 1; std::getline(file, text); ++line) {
        if (text.empty() || text[0] == '#') {
            continue;
        }
        const std::size_t colon = text.find(':');
        if (colon == 0 || colon == std::string::npos || colon + 1 == text.size()) {
            refuse(path, line, "user:hash is expected");
        }
        if (text[colon + 1] != '$') {
            refuse(path, line, "not a hash as crypt(3) makes it");
        }
        if (!users.emplace(text.substr(0, colon), text.substr(colon + 1)).second) {
            refuse(path, line, "a user who stands above already");
        }
    }
    if (!file.eof()) {
        throw std::runtime_error("cannot read " + path);
    }
    return users;
}

bool sameText(const char* left, const std::string& right) {
    if (std::strlen(left) != right.size()) {
        return false;
    }
    unsigned difference = 0;
    for (std::size_t i = 0; i < right.size(); ++i) {
        difference |= static_cast<unsigned char>(left[i]) ^ static_cast<unsigned char>(right[i]);
    }
    return difference == 0;
}

bool hashesTo(const std::string& password, const std::string& hash) {
    const auto data = std::make_unique<crypt_data>();
    const char* const result = crypt_r(password.c_str(), hash.c_str(), data.get());
    const bool same = result != nullptr && result[0] == '$' && sameText(result, hash);
    explicit_bzero(data.get(), sizeof(crypt_data));
    return same;
}

class UserFileChecker final : public PasswordChecker {
public:
    explicit UserFileChecker(std::string path) : path_(std::move(path)) { readUsers(path_); }

    bool check(const std::string& user, const std::string& password) const override {
        // crypt takes a C string: what stands behind a NUL would not count.
        if (password.find('\0') != std::string::npos) {
            return false;
        }
        try {
            const auto users = readUsers(path_);
            const auto found = users.find(user);
            if (found == users.end()) {
                hashesTo(password, users.empty() ? kNobodysHash : users.begin()->second);
                return false;
            }
            return hashesTo(password, found->second);
        } catch (const std::exception&) {
            return false; // damaged since the start
        }
    }

private:
    const std::string path_;
};

} // namespace

std::unique_ptr<PasswordChecker> userFileChecker(const std::string& path) {
    return std::make_unique<UserFileChecker>(path);
}

} // namespace qelo::server
