// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <cstdlib>
#include <dlfcn.h>

/// The function that a definition of the same name in the program, or in a preloaded library,
/// hides.
///
///     extern "C" int fsync(int file)
///     {
///         ORIGINAL(fsync);
///         return original(file);
///     }
template <class Function>
Function NextFunction(Function, char const* name)
{
    void* found = dlsym(RTLD_NEXT, name);
    if (!found)
        std::abort();
    return reinterpret_cast<Function>(found);
}

/// Defines `original`, what `name` would be without the definition around it.
#define ORIGINAL(name) static const auto original = NextFunction(&::name, #name)
