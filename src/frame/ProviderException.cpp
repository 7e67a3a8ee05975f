#include <ProviderException.h>

namespace Tesk {

ProviderException::~ProviderException() = default;

const char* ProviderException::what() const noexcept { return message_.c_str(); }

} // namespace Tesk
