// What the HTTP header of a CIM request must say (DMTF DSP0200), apart from credentials.
#pragma once

#include "Refusal.h"

#include <cimxml/Request.h>

#include <functional>
#include <optional>
#include <string>

namespace qelo::server {

// The value of a header field, by its name ignoring case; nothing when it is not there.
using HeaderLookup = std::function<std::optional<std::string>(const char* name)>;

// Checks what can be said before the body is there: method, path, content type and encoding,
// length, and the extension headers of CIM.
HttpRefusal checkRequestHeader(const std::string& method, const std::string& path,
                               const HeaderLookup& header, std::size_t largestBody);

// Whether CIMMethod and CIMObject, which firewalls look at, say what the body says.
HttpRefusal checkHeaderMatch(const cimxml::Request& request, const HeaderLookup& header);

// The text with %XX replaced by bytes (RFC 3986); nothing when a % is not followed by two
// hexadecimal digits.
std::optional<std::string> percentDecoded(const std::string& text);

} // namespace qelo::server
