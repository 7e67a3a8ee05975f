// Which provider serves which class.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <string>
#include <vector>

namespace qelo::broker {

enum class ProviderType : std::uint8_t {
    Instance,
    Association,
    Method,
    Property,
    Indication,
};
constexpr std::size_t providerTypeCount = 5;
constexpr std::array<ProviderType, providerTypeCount> allProviderTypes = {
    ProviderType::Instance, ProviderType::Association, ProviderType::Method, ProviderType::Property,
    ProviderType::Indication};

// "Instance", "Association" ...: the word in the name of the factory function.
const char* providerTypeName(ProviderType type);

class ProviderTypes {
public:
    ProviderTypes() = default;
    ProviderTypes(std::initializer_list<ProviderType> types) {
        for (ProviderType type : types) {
            add(type);
        }
    }
    void add(ProviderType type) { bits_ = static_cast<std::uint8_t>(bits_ | bit(type)); }
    bool has(ProviderType type) const { return (bits_ & bit(type)) != 0; }
    bool empty() const { return bits_ == 0; }

private:
    static std::uint8_t bit(ProviderType type) {
        return static_cast<std::uint8_t>(1U << static_cast<unsigned>(type));
    }
    std::uint8_t bits_ = 0;
};

struct ProviderRegistration {
    std::string className;
    std::vector<std::string> nameSpaces;
    // The name in front of _Create_<Type>MI.
    std::string provider;
    // "X" for libX.so or libX.so.1 in one of the provider directories, or an absolute path.
    std::string library;
    ProviderTypes types;
};

} // namespace qelo::broker
