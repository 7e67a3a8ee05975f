// Writes a request as XML: the opposite of parseRequest().
#pragma once

#include "Request.h"

#include <string>

namespace qelo::cimxml {

// Appends the whole body. An instance among the parameters is written with its path if that
// has keys. Throws nothing but std::bad_alloc; text that XML cannot hold becomes U+FFFD.
void writeRequest(std::string& out, const Request& request);

} // namespace qelo::cimxml
