// Classes in the forms that commands print.
#pragma once

#include <cim/Class.h>

#include <string>
#include <vector>

namespace qelo::cli {

// The class as MOF: its qualifiers, then every property and method, inherited ones behind a
// comment that names the class they come from.
std::string classMof(const cim::Class& known);

// {"class", "superclass", "qualifiers", "properties", "methods"}, ending in a new line.
std::string classJson(const cim::Class& known);

// An array of strings, ending in a new line.
std::string classNamesJson(const std::vector<std::string>& names);

} // namespace qelo::cli
