// What the process ends with, and the names of CIM status codes. Status codes of CIM stand
// below 64; from there on the numbers are those of sysexits.h, so the two never meet.
#pragma once

#include <string>

namespace qelo::cli {

enum ExitStatus : int {
    ExitSuccess = 0,
    ExitUsage = 64,       // the command line cannot be understood
    ExitNoInput = 66,     // the store of --store or the schema cannot be read
    ExitUnavailable = 69, // the server of --url cannot be reached
    ExitSoftware = 70,    // something that should not happen
    ExitOutput = 74,      // the output cannot be written
    ExitClosedPipe = 141, // the reader of the output has gone; as if SIGPIPE had ended us
};

// The exit status for a CIM status code: the code itself from 1 to 63, otherwise 1.
int exitStatusOf(unsigned int cimStatus);

// "CIM_ERR_NOT_FOUND"; "CIM_ERR_FAILED" for codes that the standard does not know.
const char* cimStatusName(unsigned int cimStatus);

} // namespace qelo::cli
