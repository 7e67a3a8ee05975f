// Administration commands through given seams.
#pragma once

#include "Attempt.h"
#include "FileSystem.h"
#include "ToolRunner.h"

#include <filesystem>
#include <string>
#include <string_view>

namespace qelo::store {

// Carries out one command as AdminCommand.h says, but logs nothing: the status text, or the
// reason for the refusal.
Attempt<std::string> executeCommand(const std::filesystem::path& root, std::string_view command,
                                    FileSystem& files, ToolRunner& tools);

} // namespace qelo::store
