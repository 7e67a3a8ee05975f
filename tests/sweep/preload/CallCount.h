// Counts the calls of the watched programs, and tells which of them are to fail.
//
// Everything in this library runs inside programs under test, between fork and exec as well:
// no memory is allocated, and nothing but system calls is used.
#pragma once

#include "FaultPlan.h"

#include <cstddef>
#include <cstdio>
#include <dlfcn.h>

#define QELO_CALL extern "C" __attribute__((visibility("default")))

// The function that is hidden by the one here, looked up once.
#define QELO_NEXT(name) static const auto real = ::qelo::sweep::next(&::name, #name);

namespace qelo::sweep {

template <class Function> Function next(Function, const char* name) {
    return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

// Each of these counts a call where the way of failing counts it, and ends the process where
// that is to happen. A call that is to fail finds errno set.

// Whether the call is to fail. A `path` below the root begins the counting.
bool fails(const char* call, const char* path = nullptr);

// The same for a call that needs room on the disk.
bool failsForRoom(const char* call, const char* path);

enum class Written { All, Half, Nothing };

// How much a call is to write of `size` bytes for an open file.
Written written(const char* call, int file, std::size_t size);

// Whether a stream cannot bring its data to its file. Half of the data is there then, and the
// rest is lost.
bool losesData(const char* call, std::FILE* stream);

// Whether the reading of a stream fails, which it then knows.
bool failsToRead(const char* call, std::FILE* stream);

} // namespace qelo::sweep
