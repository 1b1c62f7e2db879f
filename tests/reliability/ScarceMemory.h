// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// Makes allocations fail on request, in programs that are built with ScarceMemory.cpp or have it
/// preloaded.
///
/// It is between everything in the process and the C library's heap, so it counts what the
/// framework, Qt and the C++ library allocate, on all threads.
///
///     ScarceMemory::failAt(7, ScarceMemory::Once);
///     log.write("x\n");
///     ScarceMemory::mend();
///     if (!ScarceMemory::reached())
///         return; // it takes fewer than seven
namespace ScarceMemory {

enum Duration { Once, FromThereOn };

/// From now on counts the allocations; the one numbered `step`, from 1, fails. 0: none does.
void failAt(long step, Duration duration);

/// Memory is plentiful again; the last shortage can still be queried.
void mend();

/// How many allocations were counted.
long count();

/// Whether one failed.
bool reached();

} // namespace ScarceMemory
