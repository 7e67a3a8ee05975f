// Lets a program overhear its own log, as a command does that tells its user why it was refused.
//
// It stands beside the interface that providers use (platform/CvLogger.h) and is no part of it:
// another library of the same soname may lack it, so a program that can do without binds to it
// weakly.
#pragma once

#include <platform/PlatformApi.h>

extern "C" {

// What is told of each line: its component, level and message, whatever the thresholds are and
// wherever the log goes. The texts hold during the call only. It must neither throw nor log.
using QeloLogListener = void (*)(void* context, const char* component, int level,
                                 const char* message);

// From now on, `listener` is told of each line that the calling thread writes to the log;
// null ends that. `context` is handed on and must live until then.
QELO_PLATFORM_API void qelo_setLogListener(QeloLogListener listener, void* context);
}
