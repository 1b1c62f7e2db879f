// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <array>
#include <cstddef>
#include <cstring>
#include <dlfcn.h>
#include <execinfo.h>

/// Where a program has crashed or does not get on: memory that runs out shows which libraries use
/// what they have allocated without a look at it, and which try again forever.
namespace CrashSite {

/// To be called in a signal handler: the file name of the program or library that was running or,
/// if it was the C library or a preloaded one that contains this function, that called it; "?" if
/// that is not known. Allocates.
inline char const* file()
{
    Dl_info own = {};
    dladdr(reinterpret_cast<void*>(&file), &own);
    const bool isPreloaded = std::strstr(own.dli_fname, ".so") != nullptr;
    std::array<void*, 32> frames = {};
    const auto count =
        static_cast<std::size_t>(backtrace(frames.data(), static_cast<int>(frames.size())));
    // First come this function and the handler, then the C library's return from it.
    bool isHandler = true;
    for (std::size_t i = 0; i < count; ++i) {
        Dl_info found = {};
        if (dladdr(frames[i], &found) == 0)
            continue;
        const char* const slash = std::strrchr(found.dli_fname, '/');
        const char* const name = slash ? slash + 1 : found.dli_fname;
        const bool isC = std::strncmp(name, "libc.", 5) == 0;
        isHandler = isHandler && !isC;
        if (!isHandler && !isC && !(isPreloaded && found.dli_fbase == own.dli_fbase))
            return name;
    }
    return "?";
}

} // namespace CrashSite
