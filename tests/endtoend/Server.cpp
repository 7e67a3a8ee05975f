#include "Server.h"

#include "Qelosim.h"

#include <crypt.h>
#include <gnutls/crypto.h>
#include <gnutls/gnutls.h>
#include <gnutls/x509.h>

#include <csignal>
#include <cstdlib>
#include <ctime>
#include <fcntl.h>
#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

namespace qelo::endtoend {
namespace {

constexpr int kStartMilliseconds = 60'000;

// The first line; empty when none comes in time.
std::string readLine(int descriptor) {
    std::string line;
    char c = 0;
    pollfd item = {descriptor, POLLIN, 0};
    while (poll(&item, 1, kStartMilliseconds) == 1 && read(descriptor, &c, 1) == 1) {
        if (c == '\n') {
            return line;
        }
        line += c;
    }
    return {};
}

std::string readAll(int descriptor) {
    std::string text;
    char buffer[4096];
    for (ssize_t got = read(descriptor, buffer, sizeof buffer); got > 0;
         got = read(descriptor, buffer, sizeof buffer)) {
        text.append(buffer, static_cast<std::size_t>(got));
    }
    return text;
}

std::string exported(gnutls_datum_t data) {
    std::string text(reinterpret_cast<const char*>(data.data), data.size);
    gnutls_free(data.data);
    return text;
}

} // namespace

Server::Server(std::vector<std::string> arguments) {
    std::vector<std::string> command = {"serve", "--listen", "127.0.0.1:0"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    command = qelosimCommand(std::move(command));
    std::vector<char*> pointers;
    for (std::string& text : command) {
        pointers.push_back(text.data());
    }
    pointers.push_back(nullptr);
    int output[2];
    int errorOutput[2];
    if (pipe2(output, O_CLOEXEC) != 0 || pipe2(errorOutput, O_CLOEXEC) != 0) {
        return;
    }
    process_ = fork();
    if (process_ == 0) {
        dup2(output[1], STDOUT_FILENO);
        dup2(errorOutput[1], STDERR_FILENO);
        setenv("LC_ALL", "C.UTF-8", 1);
        execv(pointers[0], pointers.data());
        _exit(127);
    }
    close(output[1]);
    close(errorOutput[1]);
    output_ = output[0];
    errorOutput_ = errorOutput[0];
    const std::string line = readLine(output_);
    const std::string expected = "listening on ";
    if (line.compare(0, expected.size(), expected) == 0) {
        url_ = line.substr(expected.size());
    } else {
        errors_ = readAll(errorOutput_);
    }
}

Server::~Server() {
    stop();
    close(output_);
    close(errorOutput_);
}

int Server::stop() {
    if (process_ <= 0) {
        return -1;
    }
    kill(process_, SIGTERM);
    errors_ += readAll(errorOutput_);
    int status = 0;
    waitpid(std::exchange(process_, -1), &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

std::string Server::urlFor(const std::string& credentials) const {
    const std::size_t host = url_.find("://") + 3;
    return credentials.empty() ? url_
                               : url_.substr(0, host) + credentials + "@" + url_.substr(host);
}

std::string Server::object(const std::string& path, const std::string& credentials) const {
    return urlFor(credentials) + "/" + path;
}

std::uint16_t Server::port() const {
    return url_.empty() ? std::uint16_t{0}
                        : static_cast<std::uint16_t>(std::stoul(url_.substr(url_.rfind(':') + 1)));
}

std::string userLine(const std::string& user, const std::string& password) {
    crypt_data data = {};
    return user + ":" + crypt_r(password.c_str(), "$6$rounds=1000$abcdefgh", &data) + "\n";
}

std::pair<std::string, std::string> selfSignedCertificate() {
    gnutls_x509_privkey_t key = nullptr;
    gnutls_x509_crt_t certificate = nullptr;
    gnutls_x509_privkey_init(&key);
    gnutls_x509_privkey_generate(key, GNUTLS_PK_ECDSA,
                                 GNUTLS_CURVE_TO_BITS(GNUTLS_ECC_CURVE_SECP256R1), 0);
    gnutls_x509_crt_init(&certificate);
    gnutls_x509_crt_set_version(certificate, 3);
    const unsigned char serial = 1;
    gnutls_x509_crt_set_serial(certificate, &serial, 1);
    gnutls_x509_crt_set_activation_time(certificate, time(nullptr) - 3600);
    gnutls_x509_crt_set_expiration_time(certificate, time(nullptr) + 3600);
    gnutls_x509_crt_set_dn(certificate, "CN=127.0.0.1", nullptr);
    const unsigned char address[] = {127, 0, 0, 1};
    gnutls_x509_crt_set_subject_alt_name(certificate, GNUTLS_SAN_IPADDRESS, address, sizeof address,
                                         GNUTLS_FSAN_SET);
    gnutls_x509_crt_set_basic_constraints(certificate, 1, 0);
    gnutls_x509_crt_set_key(certificate, key);
    gnutls_x509_crt_sign2(certificate, certificate, key, GNUTLS_DIG_SHA256, 0);
    gnutls_datum_t certificateText = {};
    gnutls_datum_t keyText = {};
    gnutls_x509_crt_export2(certificate, GNUTLS_X509_FMT_PEM, &certificateText);
    gnutls_x509_privkey_export2(key, GNUTLS_X509_FMT_PEM, &keyText);
    gnutls_x509_crt_deinit(certificate);
    gnutls_x509_privkey_deinit(key);
    return {exported(certificateText), exported(keyText)};
}

} // namespace qelo::endtoend
