#include "ServerAddress.h"

#include <curl/curl.h>

#include <algorithm>
#include <cctype>
#include <memory>
#include <string_view>

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

// Of host names and of zones. Whatever is beyond ASCII is left to the resolver.
bool isNameCharacter(char c) {
    return std::isalnum(static_cast<unsigned char>(c)) != 0 || c == '-' || c == '.' || c == '_' ||
           (static_cast<unsigned char>(c) & 0x80U) != 0;
}

// Escapes are gone by now, and may have stood for anything.
bool isHost(std::string_view host) {
    const bool number = !host.empty() && host.front() == '['; // checked by libcurl
    return number || std::all_of(host.begin(), host.end(), isNameCharacter);
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
    const std::string zone = part(url, CURLUPART_ZONEID).value_or("");
    if (!isHost(part(url, CURLUPART_HOST).value_or("")) ||
        !std::all_of(zone.begin(), zone.end(), isNameCharacter)) {
        return "no host is called that";
    }
    return {};
}

// The host as it is written in a URL, with the zone of a link-local address (RFC 6874).
std::string hostOf(const Url& url) {
    std::string host = part(url, CURLUPART_HOST).value_or("");
    if (const auto zone = part(url, CURLUPART_ZONEID); zone && !host.empty()) {
        host.insert(host.size() - 1, "%25" + *zone);
    }
    return host;
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
    address.host = hostOf(url);
    const auto port = part(url, CURLUPART_PORT);
    address.port = port ? static_cast<std::uint16_t>(std::stoul(*port))
                        : (address.tls ? kTlsPort : kPlainPort);
    address.user = user.value_or("");
    address.password = password;
    return address;
}

} // namespace qelo::client
