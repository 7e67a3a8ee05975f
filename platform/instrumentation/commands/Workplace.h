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
    // Where it is noted, if anywhere, that the command has come to its end: what goes wrong from
    // then on must not be told as if nothing had changed.
    bool* done = nullptr;
};

} // namespace qelo::store
