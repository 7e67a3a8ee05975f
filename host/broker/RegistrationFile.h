// Registrations of providers in the form that SFCB uses: for each class a section
//
//   [ClassName]
//      provider: SimAccountProvider
//      location: libraryName
//      type: instance method
//      namespace: root/cimv2 root/other
//
// with "#" comments, and blanks and empty lines anywhere.
#pragma once

#include "Registration.h"

#include <schema/Mof.h>

#include <string>
#include <string_view>
#include <vector>

namespace qelo::broker {

struct RegistrationFile {
    std::vector<ProviderRegistration> registrations; // in the order of the file
    std::vector<std::string> warnings;               // "file:line: ..." for what is ignored
};

// Reads the text of the file named `name`. Throws schema::SchemaError ("file:line: ...") for
// lines that are neither of the above nor of that form, for values that mean nothing, and for
// a class that lacks one of the four. Other keys, such as unload and group, are ignored.
RegistrationFile parseRegistrations(const std::string& name, std::string_view text);

} // namespace qelo::broker
