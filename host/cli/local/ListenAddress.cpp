#include "ListenAddress.h"

#include <charconv>

namespace qelo::cli {
namespace {

std::optional<std::uint16_t> parsePort(const std::string& text) {
    std::uint16_t port = 0;
    const char* const end = text.data() + text.size();
    const auto [behind, error] = std::from_chars(text.data(), end, port);
    return error == std::errc() && behind == end && !text.empty() ? std::make_optional(port)
                                                                  : std::nullopt;
}

} // namespace

std::string ListenAddress::text(std::uint16_t otherPort) const {
    const bool ipv6 = address.find(':') != std::string::npos;
    return (ipv6 ? "[" + address + "]" : address) + ":" + std::to_string(port.value_or(otherPort));
}

std::optional<ListenAddress> parseListenAddress(const std::string& text) {
    ListenAddress result;
    std::string behind; // ":PORT" or nothing
    if (!text.empty() && text.front() == '[') {
        const std::size_t close = text.find(']');
        if (close == std::string::npos) {
            return std::nullopt;
        }
        result.address = text.substr(1, close - 1);
        behind = text.substr(close + 1);
    } else {
        const std::size_t colon = text.find(':');
        result.address = text.substr(0, colon);
        behind = colon == std::string::npos ? "" : text.substr(colon);
    }
    if (!behind.empty()) {
        result.port = behind.front() == ':' ? parsePort(behind.substr(1)) : std::nullopt;
        if (!result.port) {
            return std::nullopt;
        }
    }
    return result.address.empty() ? std::nullopt : std::make_optional(result);
}

} // namespace qelo::cli
