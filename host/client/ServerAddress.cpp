#include "ServerAddress.h"

#include <curl/curl.h>

#include <memory>

namespace qelo::client {
namespace {

constexpr std::uint16_t kPlainPort = 5988;
constexpr std::uint16_t kTlsPort = 5989;

struct Free {
    void operator()(CURLU* url) const { curl_url_cleanup(url); }
    void operator()(char* text) const { curl_free(text); }
};
using Url = std::unique_ptr<CURLU, Free>;

// One part of the URL; nothing when it has none.
std::optional<std::string> part(const Url& url, CURLUPart which, unsigned int flags = 0) {
    char* text = nullptr;
    if (curl_url_get(url.get(), which, &text, flags) != CURLUE_OK) {
        return std::nullopt;
    }
    const std::unique_ptr<char, Free> owner(text);
    return std::string(text);
}

std::string problemOf(const Url& url) {
    const std::string scheme = part(url, CURLUPART_SCHEME).value_or("");
    if (scheme != "http" && scheme != "https") {
        return "http or https is expected";
    }
    if (part(url, CURLUPART_PATH).value_or("/") != "/" || part(url, CURLUPART_QUERY) ||
        part(url, CURLUPART_FRAGMENT)) {
        return "nothing may follow the host and port";
    }
    if (part(url, CURLUPART_PORT).value_or("1") == "0") {
        return "port 0 is nobody's";
    }
    // Left over from an escape of an escape, which would be taken for one the next time.
    if (part(url, CURLUPART_HOST).value_or("").find('%') != std::string::npos) {
        return "no host is called that";
    }
    return {};
}

} // namespace

std::string ServerAddress::text() const {
    return (tls ? "https://" : "http://") + host + ":" + std::to_string(port);
}

std::optional<ServerAddress> parseServerUrl(const std::string& text, std::string& error) {
    error = "http[s]://[user[:password]@]host[:port] is expected";
    const Url url(curl_url());
    if (!url || text.find('\0') != std::string::npos ||
        curl_url_set(url.get(), CURLUPART_URL, text.c_str(), 0) != CURLUE_OK) {
        return std::nullopt;
    }
    if (std::string problem = problemOf(url); !problem.empty()) {
        error = std::move(problem);
        return std::nullopt;
    }
    const auto user = part(url, CURLUPART_USER, CURLU_URLDECODE);
    const auto password = part(url, CURLUPART_PASSWORD, CURLU_URLDECODE);
    const bool undecodable = !user && part(url, CURLUPART_USER);
    if (undecodable || (!password && part(url, CURLUPART_PASSWORD)) ||
        user.value_or("").find(':') != std::string::npos) {
        error = "user or password cannot be meant";
        return std::nullopt;
    }
    ServerAddress address;
    address.tls = part(url, CURLUPART_SCHEME) == "https";
    address.host = part(url, CURLUPART_HOST).value_or("");
    const auto port = part(url, CURLUPART_PORT);
    address.port = port ? static_cast<std::uint16_t>(std::stoul(*port))
                        : (address.tls ? kTlsPort : kPlainPort);
    address.user = user.value_or("");
    address.password = password;
    return address;
}

} // namespace qelo::client
