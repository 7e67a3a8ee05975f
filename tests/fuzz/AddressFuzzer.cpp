// Addresses from command lines and settings: URLs of servers and where to listen. What is
// taken has a host and a port and is read the same when printed; a password is never repeated.
#include "FuzzInput.h"

#include <cli/local/ListenAddress.h>
#include <client/ServerAddress.h>

namespace {

using qelo::fuzz::require;

void checkUrl(const std::string& text) {
    std::string error;
    const auto address = qelo::client::parseServerUrl(text, error);
    if (!address) {
        require(!error.empty() && error.size() < 100);
        return;
    }
    require(!address->host.empty() && address->port != 0);
    require(address->host.find_first_of(std::string_view("/@?#\0 \n", 7)) == std::string::npos);
    require(address->user.find(':') == std::string::npos);
    // A host may be spelled in a usual form when it is read again ("3" as 0.0.0.3).
    const auto again = qelo::client::parseServerUrl(address->text(), error);
    require(again && again->tls == address->tls && again->port == address->port &&
            again->user.empty() && !again->password);
    const auto third = qelo::client::parseServerUrl(again->text(), error);
    require(third && third->host == again->host && third->text() == again->text());
}

void checkListen(const std::string& text) {
    const auto address = qelo::cli::parseListenAddress(text);
    if (!address) {
        return;
    }
    require(!address->address.empty() && text.find(address->address) != std::string::npos);
    if (address->address.find_first_of("[]") != std::string::npos) {
        return; // no address of any kind; refused where it is used
    }
    const auto again = qelo::cli::parseListenAddress(address->text(5988));
    require(again && again->address == address->address && again->port);
    require(*again->port == address->port.value_or(5988));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(qelo::fuzz::viewOf(data, size));
    checkUrl(text);
    checkUrl("https://" + text);
    checkListen(text);
    return 0;
}
