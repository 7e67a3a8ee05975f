// Method calls as command texts for the node store:
//
//   Method,Name:CMPI_string:text,Number:CMPI_uint32:30,Date:CMPI_dateTime:20140307123005.000000+000
//
// Nothing is quoted or escaped; a text argument passes the platform's gate first. A command
// holds at most 1023 characters and is cut there.
#pragma once

#include "Instrumentation.h"

#include <UnitTrace.h>

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

#include <string>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Packs a method and its arguments, in the order of the broker, into `command`. Returns false
// when the gate refuses a text argument or the broker fails to give one; `command` is then
// unusable. A missing `in` has no
// arguments. Numbers are printed signed. An argument of any other type contributes its name alone.
bool packCommand(const char* methodName, const CMPIArgs* in, std::string& command);

// How sending a command ended.
enum class CommandOutcome {
    NoAdministration, // there is no node to send it to
    Refused,          // an argument did not pass the gate
    NotAccepted,      // the store did not take it, which is traced
    Accepted
};

// Packs a method call and writes it to the administration node, on which `cursor` then
// stands. Whatever the store throws goes to the caller.
CommandOutcome sendCommand(const UnitTrace& unit, Instrumentation& cursor, const char* methodName,
                           const CMPIArgs* in, TraceSite site);

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
