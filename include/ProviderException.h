// The exception of the provider's own checks, thrown while records are loaded. Handlers
// receive it as a std::exception.
#pragma once

#include <exception>
#include <string>

namespace Tesk {

class ProviderException : public std::exception {
public:
    explicit ProviderException(const char* message) : message_(message) {}
    ProviderException(const ProviderException&) = default;
    ProviderException& operator=(const ProviderException&) = default;
    ~ProviderException() override;

    // The message; owned by the exception.
    const char* what() const noexcept override;

private:
    std::string message_;
};

} // namespace Tesk
