// The lines of one account file and the fields of a line.
#pragma once

#include "Attempt.h"
#include "FileSystem.h"
#include "RootDirectory.h"

#include <chrono>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::store {

using Lines = std::vector<std::string>;
using Fields = std::vector<std::string>;

// The parts of `text` between the separators: always one more than there are separators.
Fields splitFields(std::string_view text, char separator);
std::string joinFields(const Fields& fields, char separator);

// The first field of a line.
std::string_view keyOf(std::string_view line);

// The lines of etc/`name`, without their line ends. A file that does not exist has none.
Attempt<Lines> readLines(const RootDirectory& root, FileSystem& files, const char* name);

// Changes lines in place; false when there is nothing to change.
using LineEdit = std::function<bool(Lines&)>;

// Rewrites etc/`name` under the tools' lock: nothing is written when `edit` answers false or
// the file does not exist. Afterwards the file holds all of the change or none of it.
Problem editLines(const RootDirectory& root, FileSystem& files, const char* name,
                  const LineEdit& edit);

} // namespace qelo::store
