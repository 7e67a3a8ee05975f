// The texts that users type, turned into CIM terms. All of them throw UsageError with a
// message that says what is wrong with which text.
#pragma once

#include "Options.h"

#include <client/Connection.h>

#include <string>
#include <vector>

namespace qelo::cli {

// The arguments of the process without its name. The two-letter options of wbemcli (-ac,
// -rc, -rr), which an ordinary parser takes for two options in one, are put into their long
// forms, up to a "--".
std::vector<std::string> spelledOut(int count, const char* const* arguments);

// "CLASS" or "NAMESPACE:CLASS", without keys.
cim::ObjectPath classPathOf(const std::string& text, const Options& options);

// A path with keys, as `ein` prints it. The namespace is that of the options if the text
// has none. Keys of the known association classes become references.
cim::ObjectPath instancePathOf(const std::string& text, const Options& options);

// Either of the two: a method may be asked of a class as well.
cim::ObjectPath anyPathOf(const std::string& text, const Options& options);

// Property names. An empty name stands for none, so that -p '' asks for the path only.
client::PropertyList propertyListOf(bool given, const std::vector<std::string>& names);

// "name=value" or "name:type=value" each, in the order given; a name may come once.
client::Arguments methodArgumentsOf(const std::vector<std::string>& texts);

// Whether a text can be the name of a class, property, method or argument.
bool isName(const std::string& text);

} // namespace qelo::cli
