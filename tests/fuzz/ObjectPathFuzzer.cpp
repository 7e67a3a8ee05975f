// Object paths from anywhere: what is read is printed so that it reads the same again.
#include <cim/ObjectPath.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

namespace {

void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    using qelo::cim::ObjectPath;
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    std::string error;
    const auto path = ObjectPath::parse(text, error);
    if (!path) {
        require(!error.empty());
        return 0;
    }
    const std::string printed = path->toText(true);
    const auto again = ObjectPath::parse(printed, error);
    require(again.has_value());
    require(*again == *path && again->host() == path->host() &&
            again->nameSpace() == path->nameSpace());
    require(again->toText(true) == printed);
    require(path->keys().size() <= 64);
    return 0;
}
