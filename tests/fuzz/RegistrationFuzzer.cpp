// Registration files from anywhere: read or refused with SchemaError, and every registration
// is whole.
#include <broker/RegistrationFile.h>

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

// The registrations written down again.
std::string textOf(const qelo::broker::RegistrationFile& file) {
    std::string text;
    for (const auto& registration : file.registrations) {
        text += "[" + registration.className + "]\nprovider: " + registration.provider +
                "\nlocation: " + registration.library + "\ntype:";
        for (const auto type : qelo::broker::allProviderTypes) {
            if (registration.types.has(type)) {
                text += std::string(" ") + qelo::broker::providerTypeName(type);
            }
        }
        text += "\nnamespace:";
        for (const std::string& nameSpace : registration.nameSpaces) {
            text += " " + nameSpace;
        }
        text += "\n";
    }
    return text;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    try {
        const auto file = qelo::broker::parseRegistrations("fuzz.reg", text);
        for (const auto& registration : file.registrations) {
            require(!registration.className.empty() && !registration.provider.empty() &&
                    !registration.library.empty() && !registration.nameSpaces.empty() &&
                    !registration.types.empty());
        }
        const std::string again = textOf(file);
        const auto same = qelo::broker::parseRegistrations("again.reg", again);
        require(textOf(same) == again && same.warnings.empty());
    } catch (const qelo::schema::SchemaError& error) {
        require(std::string(error.what()).rfind("fuzz.reg:", 0) == 0);
    }
    return 0;
}
