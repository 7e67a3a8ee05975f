// The server could not be talked to at all: no such host, nobody listening, no trusted
// certificate. Apart from CimError, because nothing was asked yet.
#pragma once

#include <stdexcept>

namespace qelo::client {

class Unreachable : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

} // namespace qelo::client
