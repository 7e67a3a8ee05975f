#include "ServerConnection.h"

#include "../CommandContext.h"
#include "../PasswordInput.h"

#include <client/HttpConnection.h>

#include <utility>

namespace qelo::cli {
namespace {

// The text itself is not repeated: it may hold a password.
client::ServerAddress addressOf(const Options& options) {
    std::string error;
    auto address = client::parseServerUrl(options.url, error);
    if (!address) {
        throw UsageError("--url: " + error);
    }
    return *std::move(address);
}

void addPassword(client::ServerAddress& address, const Options& options) {
    const bool fromFile = !options.passwordFile.empty();
    if (address.user.empty() && fromFile) {
        throw UsageError("--password-file: --url names no user");
    }
    if (fromFile && address.password) {
        throw UsageError("--password-file: --url holds a password already");
    }
    if (!address.user.empty() && !address.password) {
        address.password = fromFile ? passwordFromFile(options.passwordFile).text()
                                    : passwordForServer(address.user, address.text()).text();
    }
}

} // namespace

std::unique_ptr<client::Connection> connectToServer(const Options& options) {
    client::HttpOptions http;
    http.server = addressOf(options);
    addPassword(http.server, options);
    http.caCertificate = options.caCertificate;
    http.insecure = options.insecure;
    return std::make_unique<client::HttpConnection>(std::move(http));
}

} // namespace qelo::cli
