#include "Source.h"

namespace qelo::nodes {

bool Source::execute(const std::string&, std::string&) { return false; }

} // namespace qelo::nodes
