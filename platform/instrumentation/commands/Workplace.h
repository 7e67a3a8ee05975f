// What every step of a command works on and through.
#pragma once

#include "FileSystem.h"
#include "RootDirectory.h"
#include "ToolRunner.h"

namespace qelo::store {

struct Workplace {
    const RootDirectory& root;
    FileSystem& files;
    ToolRunner& tools;
};

} // namespace qelo::store
