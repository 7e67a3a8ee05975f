// An answer without CIM-XML: HTTP itself says what is wrong (DMTF DSP0200, "Errors and Status
// Codes").
#pragma once

#include <string>
#include <utility>

namespace qelo::server {

struct HttpRefusal {
    unsigned int status = 0; // 0: none
    std::string text;        // one line for people
    std::string cimError;    // value of the header CIMError; empty: none

    explicit operator bool() const { return status != 0; }
};

} // namespace qelo::server
