// Whole files as texts.
#pragma once

#include "Attempt.h"
#include "FileSystem.h"

#include <string>
#include <string_view>

namespace qelo::store {

// The content of a plain file of at most 64 MiB.
Attempt<std::string> readSmallFile(FileSystem& files, int directory, const std::string& name);

// Makes a file that must not exist yet, with exactly this mode, and brings it to the disk.
// Nothing is left of it after a failure.
Problem writeNewFile(FileSystem& files, int directory, const std::string& name,
                     std::string_view text, mode_t mode);

// Puts a new content in the place of a file's old one: readers see the one or the other,
// whole, also after a crash. Owner, group and mode stay. Both need the file's lock.
Problem replaceFile(FileSystem& files, int directory, const std::string& name,
                    std::string_view text);

// The name of a file's new content until it is in place. A process that is killed may leave it.
std::string draftOf(const std::string& name);

// Removes a file that must not stay, such as a lock: tries again when it does not go.
void removeSurely(FileSystem& files, int directory, const std::string& name);

} // namespace qelo::store
