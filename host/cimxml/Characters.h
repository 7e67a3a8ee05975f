// Text as XML 1.0 writes it. The result is always well-formed UTF-8: stray bytes and the
// characters that XML does not know become U+FFFD.
#pragma once

#include <string>
#include <string_view>

namespace qelo::cimxml {

// As the content of an element: & < > escaped, and carriage returns, which would be taken
// for line ends.
void appendText(std::string& out, std::string_view text);

// Between double quotes: the same, and quotes, tabs and line ends.
void appendAttributeText(std::string& out, std::string_view text);

// name="text", with a blank in front.
void appendAttribute(std::string& out, std::string_view name, std::string_view text);

} // namespace qelo::cimxml
