// Reading MOF (DMTF DSP0004, version 2.x) into a repository of classes.
//
// Understood are qualifier declarations, classes, static instances with aliases, and the
// pragmas "include" and "namespace"; other pragmas are ignored. A qualifier that has no
// declaration is taken as it is written when its value tells the type: a flag, a string, a
// character, a real, a boolean, or an array of them.
//
// The text may be hostile: its size, the depth and number of includes, the numbers of
// elements and the size of what inheritance multiplies are bounded; nothing recurses except
// includes.
#pragma once

#include "ClassRepository.h"

#include <filesystem>
#include <functional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::schema {

// What is wrong with a schema, in one line. What a file is to blame for begins with
// "file:line:column: ", or "file:line: " where lines are all that counts.
class SchemaError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

struct MofSource {
    std::string name; // as error messages and includes name it
    std::string text;
};

// The text that `target` stands for in an include of the file named `including`. Throws
// std::runtime_error (what(): why not) when there is none.
using IncludeResolver =
    std::function<MofSource(const std::string& including, const std::string& target)>;

// Adds everything that the text declares to the namespace. An empty resolver refuses every
// include. Throws SchemaError at the first error; what stood before it has been added.
void readMof(const MofSource& source, const std::string& nameSpace, const IncludeResolver& include,
             ClassRepository& repository);

// The same from a file. Includes are relative to the file that has them, and must not leave
// the folder of `file`.
void loadMofFile(const std::filesystem::path& file, const std::string& nameSpace,
                 ClassRepository& repository);

// The files of a folder that end in `extension`, sorted. SchemaError when the folder cannot
// be read.
std::vector<std::filesystem::path> schemaFiles(const std::filesystem::path& folder,
                                               std::string_view extension);

// Loads every *.mof file of a folder that no other file there includes, in sorted order.
void loadMofFolder(const std::filesystem::path& folder, const std::string& nameSpace,
                   ClassRepository& repository);

// The whole text of a schema file. SchemaError when it cannot be read or is unreasonably
// large.
std::string readSchemaFile(const std::filesystem::path& file);

} // namespace qelo::schema
