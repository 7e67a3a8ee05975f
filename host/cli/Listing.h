// What the commands that list a whole class have in common.
#pragma once

#include "Arguments.h"
#include "CommandContext.h"
#include "render/Table.h"

#include <cim/Instance.h>

#include <string>

namespace qelo::cli {

// The text of a property for a table; "-" when the instance does not have it or it is null.
std::string cellText(const cim::Instance& instance, const char* property);

// "1 account", "2 accounts".
std::string counted(std::size_t number, const char* singular, const char* plural);

// The table and, behind an empty line, the summary. A table without rows is not shown.
void writeTable(CommandContext& context, const Table& table, const std::string& summary);

// All instances of the class with all their properties, in the format of the options.
void writeInstances(CommandContext& context, const std::string& className);

} // namespace qelo::cli
